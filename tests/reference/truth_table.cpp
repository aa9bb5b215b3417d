// The model's truth table: one evaluation of the whole tree for each row.
#include "reference/equation.h"

namespace reference {

namespace {

const size_t kMaxVariables = 30;

} // namespace

bool Row::operator==(const Row& other) const
{
    return m_result_value == other.m_result_value && m_variable_values == other.m_variable_values;
}

TruthTable& TruthTable::operator=(const Equation& equation)
{
    Build(equation);
    return *this;
}

void TruthTable::Build(const Equation& equation)
{
    m_equation.clear();
    m_rows.clear();
    m_variable_names.clear();
    const size_t numVariables = equation.GetNumVariables();
    if (!equation || numVariables == 0 || numVariables > kMaxVariables)
        return;
    m_equation = equation.GetEquation(false);
    for (const Equation::Variable& variable : equation.GetVariables())
        m_variable_names.push_back(variable.first);
    Equation copy = equation;
    for (size_t row = 0; row < (size_t(1) << numVariables); ++row) {
        std::vector<unsigned int> values;
        for (size_t column = 0; column < numVariables; ++column) {
            values.push_back((row >> (numVariables - 1 - column)) & 1);
            copy.SetVariable(m_variable_names[column], values.back());
        }
        const unsigned int result = copy.Eval();
        m_rows.push_back(Row(result, values));
    }
}

bool TruthTable::operator==(const TruthTable& other) const
{
    return m_variable_names == other.m_variable_names && m_rows == other.m_rows;
}

} // namespace reference
