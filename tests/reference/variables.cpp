// The model's variable table, handles and init-value texts.
#include <algorithm>

#include "reference/equation.h"
#include "reference/init_text.h"

namespace reference {

namespace {

bool IsLetter(char c)
{
    return (c >= 'A' && c <= 'Z') || (c >= 'a' && c <= 'z') || c == '_';
}

bool IsLegalName(const std::string& wholeName)
{
    const std::string name = wholeName.substr(0, wholeName.find('\0'));
    if (name.empty())
        return false;
    if (name[0] == '\'')
        return name.find('\'', 1) != std::string::npos;
    return IsLetter(name[0]) && std::all_of(name.begin(), name.end(), [](char c) {
               return IsLetter(c) || (c >= '0' && c <= '9');
           });
}

std::vector<unsigned int> ResultColumn(const TruthTable& table)
{
    std::vector<unsigned int> column;
    for (const Row& row : table.GetRows())
        column.push_back(row.GetResultValue());
    return column;
}

} // namespace

size_t Equation::FindVariable(const std::string& name) const
{
    for (size_t index = 0; index < m_variables.size(); ++index) {
        if (m_variables[index].first == name)
            return index;
    }
    return m_variables.size();
}

bool Equation::DefineVariable(const std::string& givenName, unsigned int value)
{
    const std::string name = givenName; // it may be a name in the table
    if (IsVariableDefined(name) || !IsLegalName(name))
        return false;
    const unsigned int index = GetNumVariables();
    m_variables.push_back(Variable(name, value ? 1 : 0));
    for (int node : m_store->list) {
        if (At(node).type == kId && At(node).token == name)
            At(node).value = index;
    }
    return true;
}

bool Equation::IsVariableDefined(const std::string& name) const
{
    return FindVariable(name) < m_variables.size();
}

bool Equation::SetVariable(const std::string& name, unsigned int value)
{
    if (!IsVariableDefined(name))
        return false;
    m_variables[FindVariable(name)].second = value ? 1 : 0;
    return true;
}

unsigned int Equation::GetVariable(const std::string& name) const
{
    return IsVariableDefined(name) ? m_variables[FindVariable(name)].second : 0;
}

bool Equation::IsVariableDefined(const Handle& handle) const
{
    return !handle.empty() && *handle.begin() < m_variables.size();
}

bool Equation::SetVariable(const Handle& handle, unsigned int value)
{
    if (!IsVariableDefined(handle))
        return false;
    m_variables[*handle.begin()].second = value ? 1 : 0;
    return true;
}

unsigned int Equation::GetVariable(const Handle& handle) const
{
    return IsVariableDefined(handle) ? m_variables[*handle.begin()].second : 0;
}

Handle Equation::GetVariableHandle(const std::string& name) const
{
    if (!IsVariableDefined(name))
        return Handle();
    std::vector<unsigned int> values(1, static_cast<unsigned int>(FindVariable(name)));
    for (size_t position = 0; position < m_store->list.size(); ++position) {
        if (At(m_store->list[position]).token == name)
            values.push_back(static_cast<unsigned int>(position));
    }
    return Handle(values);
}

std::vector<std::string> Equation::VariableNames() const
{
    std::vector<std::string> names;
    for (const Variable& variable : m_variables)
        names.push_back(variable.first);
    return names;
}

std::string Equation::GetEquationAsHexInitValue(bool upperCase) const
{
    return HexInitValue(ResultColumn(GetTruthTable()), upperCase);
}

std::string Equation::GetEquationAsBinaryInitValue() const
{
    return BinaryInitValue(ResultColumn(GetTruthTable()));
}

std::string Equation::GetInitValueTermEquation() const
{
    std::string text;
    for (size_t index = m_variables.size(); index-- > 0;)
        text += text.empty() ? m_variables[index].first : "+" + m_variables[index].first;
    return text;
}

} // namespace reference
