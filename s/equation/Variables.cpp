// The variable table: names in order of definition, values 0 or 1, handles.
// Defining a variable links it to the tree: its index goes into every ID node of its name.
// Fails: false or 0 for unknown or illegal names; std::bad_alloc.
// Cost: a look-up walks the table.
#include <Kq_BoolEquationImp.h>

#include <cassert>

#include "NameIndex.h"
#include "Store.h"
#include "Tokens.h"

typedef Port::StringBase<char> String;
typedef std::pair<String, unsigned int> Variable;

size_t Kq_BoolEquationImp::FindVariable(const String& name) const
{
    for (size_t index = 0; index < m_variables.size(); ++index) {
        if (KqIsSameText(m_variables[index].first, name))
            return index;
    }
    return kKqNotFound;
}

inline size_t Kq_BoolEquationImp::FindVariable(const Kq_BoolEquation::Handle& handle) const
{
    if (handle.empty())
        return kKqNotFound;
    const size_t index = *handle.begin();
    return index < m_variables.size() ? index : kKqNotFound;
}

bool Kq_BoolEquationImp::DefineVariable(const String& name, unsigned int value)
{
    if (FindVariable(name) != kKqNotFound || name.length() == 0 || !KqIsLegalName(name))
        return false;
    const unsigned int variableIndex = GetNumVariables();
    m_variables.push_back(Variable(name, value ? 1u : 0u));
    m_store->LinkVariable(name, variableIndex);
    assert(FindVariable(name) == variableIndex); // invariant 2
    return true;
}

bool Kq_BoolEquationImp::IsVariableDefined(const String& name) const
{
    return FindVariable(name) != kKqNotFound;
}

// Deliberate: only the index of a handle counts, whatever equation it came from.
bool Kq_BoolEquationImp::IsVariableDefined(const Kq_BoolEquation::Handle& handle) const
{
    return FindVariable(handle) != kKqNotFound;
}

bool Kq_BoolEquationImp::SetVariable(const String& name, unsigned int value)
{
    const size_t index = FindVariable(name);
    if (index == kKqNotFound)
        return false;
    m_variables[index].second = value ? 1u : 0u;
    return true;
}

bool Kq_BoolEquationImp::SetVariable(const Kq_BoolEquation::Handle& handle, unsigned int value)
{
    const size_t index = FindVariable(handle);
    if (index == kKqNotFound)
        return false;
    m_variables[index].second = value ? 1u : 0u;
    return true;
}

unsigned int Kq_BoolEquationImp::GetVariable(const String& name) const
{
    const size_t index = FindVariable(name);
    return index == kKqNotFound ? 0u : m_variables[index].second;
}

unsigned int Kq_BoolEquationImp::GetVariable(const Kq_BoolEquation::Handle& handle) const
{
    const size_t index = FindVariable(handle);
    return index == kKqNotFound ? 0u : m_variables[index].second;
}

Kq_BoolEquation::Handle Kq_BoolEquationImp::GetVariableHandle(const String& name) const
{
    const size_t index = FindVariable(name);
    if (index == kKqNotFound)
        return Kq_BoolEquation::Handle();
    return Kq_BoolEquation::Handle(m_store->MakeHandle(name, static_cast<unsigned int>(index)));
}

unsigned int Kq_BoolEquationImp::GetNumVariables() const
{
    return static_cast<unsigned int>(m_variables.size());
}

const std::vector<Variable>& Kq_BoolEquationImp::GetVariables() const
{
    return m_variables;
}

std::vector<String> Kq_BoolEquationImp::GetVariableNames() const
{
    std::vector<String> names;
    names.reserve(m_variables.size());
    for (const Variable& variable : m_variables)
        names.push_back(variable.first);
    return names;
}
