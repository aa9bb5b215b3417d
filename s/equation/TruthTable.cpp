// Truth table: the result column as rows, and comparison of tables.
// In debug mode every row is evaluated node by node, because then the trace is output.
// Fails: std::bad_alloc, with the rows appended so far.  Cost: O(2^n * n) for the rows.
#include <Kq_BoolEquationImp.h>

#include <algorithm>
#include <cassert>

#include "Messages.h"
#include "Name.h"
#include "Results.h"

typedef Port::StringBase<char> String;
typedef Kq_BoolEquationImp::TruthTable TruthTable;
typedef TruthTable::Row Row;

namespace {

// Makes 'values' those of row 'rowIndex', the first variable being the most significant bit.
void SetRowValues(uint32_t rowIndex, std::vector<unsigned int>& values)
{
    for (size_t column = values.size(); column-- > 0; rowIndex >>= 1)
        values[column] = rowIndex & 1u;
    assert(rowIndex == 0);
}

// Appends all rows of the column, each with one allocation.
void AppendRows(KqResults results, std::vector<unsigned int>& values, std::vector<Row>& rows)
{
    constexpr size_t kWords = 256;
    uint64_t words[kWords];
    const uint32_t numRows = uint32_t(1) << values.size();
    for (uint32_t rowIndex = 0; rowIndex < numRows; ++rowIndex) {
        const size_t word = rowIndex / 64;
        if (rowIndex % (64 * kWords) == 0)
            results.Fill(word, std::min(kWords, results.GetNumWords() - word), words);
        SetRowValues(rowIndex, values);
        rows.emplace_back(words[word % kWords] >> (rowIndex % 64) & 1u, values);
    }
}

// Appends all rows, evaluated one by one, with their traces and dumps while debug mode is on.
void AppendTracedRows(const Kq_BoolEquationImp::Node& root,
                      std::vector<std::pair<String, unsigned int>> variables,
                      std::vector<unsigned int>& values, std::vector<Row>& rows)
{
    const uint32_t numRows = uint32_t(1) << values.size();
    for (uint32_t rowIndex = 0; rowIndex < numRows; ++rowIndex) {
        SetRowValues(rowIndex, values);
        for (size_t column = 0; column < values.size(); ++column)
            variables[column].second = values[column];
        const unsigned int result = root.Eval(variables);
        if (KqDebugMode::IsOn())
            root.Dbg();
        rows.emplace_back(result, values);
    }
}

} // namespace

Row::Row(unsigned int resultValue, const std::vector<unsigned int>& variableValues)
    : m_variable_values(variableValues), m_result_value(resultValue)
{
}

Row::Row(const Row& other) = default;

Row::~Row() = default;

Row& Row::operator=(const Row& other) = default;

unsigned int Row::GetResultValue() const
{
    return m_result_value;
}

const std::vector<unsigned int>& Row::GetVariableValues() const
{
    return m_variable_values;
}

bool Row::operator==(const Row& other) const
{
    return m_result_value == other.m_result_value && m_variable_values == other.m_variable_values;
}

bool Row::operator!=(const Row& other) const
{
    return !(*this == other);
}

TruthTable::TruthTable() = default;

TruthTable::TruthTable(const Kq_BoolEquationImp& equation)
{
    Build(equation);
}

TruthTable::TruthTable(const TruthTable& other) = default;

TruthTable::~TruthTable() = default;

TruthTable& TruthTable::operator=(const TruthTable& other)
{
    if (this == &other)
        return *this;
    TruthTable copy(other);
    m_equation = copy.m_equation;
    m_variable_names.swap(copy.m_variable_names);
    m_rows.swap(copy.m_rows);
    return *this;
}

TruthTable& TruthTable::operator=(const Kq_BoolEquationImp& equation)
{
    Build(equation);
    return *this;
}

void TruthTable::Build(const Kq_BoolEquationImp& equation)
{
    m_equation = "";
    m_rows.clear();
    m_variable_names.clear();
    const unsigned int numVariables = equation.GetNumVariables();
    // Deliberate: a constant has no table rather than one of a single row.
    if (!equation || numVariables > kKqMaxColumnVariables || numVariables == 0)
        return;
    const bool isTraced = KqDebugMode::IsOn();
    // Built separately, because a message's receiver may change this table.
    TruthTable apart;
    TruthTable& built = isTraced ? apart : *this;
    built.m_equation = equation.GetEquation(false);
    built.m_variable_names = equation.GetVariableNames();
    std::vector<unsigned int> values(numVariables);
    built.m_rows.reserve(size_t(1) << numVariables);
    if (!isTraced) {
        AppendRows(KqResults(*equation.m_store, numVariables), values, built.m_rows);
        return;
    }
    const auto takeBuilt = [&] {
        m_equation = built.m_equation; // all that can fail comes first
        m_variable_names.swap(built.m_variable_names);
        m_rows.swap(built.m_rows);
    };
    const Kq_BoolEquationImp held(equation); // the receiver may change the equation too
    try {
        AppendTracedRows(*held.GetRoot(), held.GetVariables(), values, built.m_rows);
    } catch (...) {
        takeBuilt();
        throw;
    }
    takeBuilt();
}

const std::vector<String>& TruthTable::GetVariableNames() const
{
    return m_variable_names;
}

const std::vector<Row>& TruthTable::GetRows() const
{
    return m_rows;
}

bool TruthTable::operator==(const TruthTable& other) const
{
    // The text is not compared: differently written equations may have equal tables.
    return m_variable_names.size() == other.m_variable_names.size() &&
           std::equal(m_variable_names.begin(), m_variable_names.end(),
                      other.m_variable_names.begin(), KqIsSameText) &&
           m_rows == other.m_rows;
}

bool TruthTable::operator!=(const TruthTable& other) const
{
    return !(*this == other);
}

bool TruthTable::operator!() const
{
    return m_variable_names.empty();
}

TruthTable::operator Kq_PtrTester*() const
{
    // Never dereferenced; any address that is not null will do.
    return m_variable_names.empty()
               ? nullptr
               : reinterpret_cast<Kq_PtrTester*>(const_cast<TruthTable*>(this));
}

TruthTable Kq_BoolEquationImp::GetTruthTable() const
{
    return TruthTable(*this);
}
