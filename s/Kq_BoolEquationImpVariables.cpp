// The variable table: names in order of definition, values 0 or 1, handles.
// Defining a variable links it to the tree: its index goes into every ID node of its name.
// Fails: false or 0 for unknown or illegal names; std::bad_alloc.
// Cost: a look-up walks the table; setting an equation uses an index for the time it takes.
#include <Kq_BoolEquationImp.h>

#include <algorithm>
#include <cstring>
#include <functional>
#include <string_view>

#include "Kq_BoolEquationImpStore.h"

typedef Port::StringBase<char> String;
typedef std::pair<String, unsigned int> Variable;

namespace {

constexpr size_t kNotFound = SIZE_MAX;

// Room made for the first variable of an equation: ordinary ones never regrow their table.
constexpr size_t kFirstVariables = 8;

size_t FindName(const std::vector<Variable>& variables, const String& name)
{
    for (size_t index = 0; index < variables.size(); ++index) {
        if (KqIsSameText(variables[index].first, name))
            return index;
    }
    return kNotFound;
}

bool IsLetterOrUnderscore(char character)
{
    return (character >= 'A' && character <= 'Z') || (character >= 'a' && character <= 'z') ||
           character == '_';
}

bool IsDigit(char character)
{
    return character >= '0' && character <= '9';
}

// Reads the characters up to the first NUL byte.
bool IsLegalName(const String& name)
{
    const char* character = name.c_str();
    // Deliberate: behind the second quote anything may follow, so "'a'+b" is a legal name.
    if (*character == '\'')
        return std::strchr(character + 1, '\'') != nullptr;
    if (!IsLetterOrUnderscore(*character))
        return false;
    while (IsLetterOrUnderscore(*character) || IsDigit(*character))
        ++character;
    return *character == '\0';
}

// Where the names of a growing table stand. Few names are searched one by one; more get a hash
// table of positions, at most half full, so that setting an equation of many names stays linear.
// Invariant: once m_slots is not empty it holds every position of the table.
class NameIndex {
  public:
    explicit NameIndex(const std::vector<Variable>& variables) : m_variables(variables) {}

    // Position of 'name', or kNotFound.
    size_t Find(const String& name)
    {
        if (m_variables.size() <= kMaxUnindexed)
            return FindName(m_variables, name);
        if (m_slots.size() < 2 * m_variables.size())
            Rebuild();
        while (m_num_indexed < m_variables.size()) {
            *SlotOf(m_variables[m_num_indexed].first) = m_num_indexed;
            ++m_num_indexed;
        }
        return *SlotOf(name);
    }

  private:
    static constexpr size_t kMaxUnindexed = 16;

    void Rebuild()
    {
        m_slots.assign(4 * m_variables.size(), kNotFound);
        m_num_indexed = 0;
    }

    // The slot that holds the position of 'name', or the free one where it belongs.
    size_t* SlotOf(const String& name)
    {
        const std::string_view text(name.c_str(), name.length());
        size_t slot = std::hash<std::string_view>()(text) % m_slots.size();
        while (m_slots[slot] != kNotFound && !KqIsSameText(m_variables[m_slots[slot]].first, name))
            slot = slot + 1 == m_slots.size() ? 0 : slot + 1;
        return &m_slots[slot];
    }

    const std::vector<Variable>& m_variables;
    std::vector<size_t> m_slots;
    size_t m_num_indexed = 0;
};

// The variable indices of the names of one text. A name of the pool is one string, so its address
// is its name. A few are searched one by one, more have a hash table, at most half full.
class PooledNames {
  public:
    // Where the index of 'name' is kept; kNotFound is kept for a name that is new.
    size_t& IndexOf(const String* name)
    {
        if (m_slots.empty()) {
            for (size_t position = 0; position < m_size; ++position) {
                if (m_first[position].name == name)
                    return m_first[position].index;
            }
            if (m_size < kMaxUnindexed) {
                m_first[m_size] = Entry{name, kNotFound};
                return m_first[m_size++].index;
            }
        }
        if (m_slots.size() < 2 * (m_size + 1))
            Rebuild();
        Entry* slot = SlotOf(name);
        if (!slot->name) {
            *slot = Entry{name, kNotFound};
            ++m_size;
        }
        return slot->index;
    }

  private:
    struct Entry {
        const String* name;
        size_t index;
    };

    static constexpr size_t kMaxUnindexed = 12;

    void Rebuild()
    {
        std::vector<Entry> entries(4 * (m_size + 1), Entry{nullptr, kNotFound});
        entries.swap(m_slots);
        if (entries.empty())
            entries.assign(m_first, m_first + m_size);
        for (const Entry& entry : entries) {
            if (entry.name)
                *SlotOf(entry.name) = entry;
        }
    }

    Entry* SlotOf(const String* name)
    {
        const uint64_t mixed = reinterpret_cast<uintptr_t>(name) * 0x9e3779b97f4a7c15u;
        size_t slot = (mixed >> 32) % m_slots.size();
        while (m_slots[slot].name && m_slots[slot].name != name)
            slot = slot + 1 == m_slots.size() ? 0 : slot + 1;
        return &m_slots[slot];
    }

    size_t m_size = 0;
    Entry m_first[kMaxUnindexed];
    std::vector<Entry> m_slots;
};

} // namespace

size_t Kq_BoolEquationImp::FindVariable(const String& name) const
{
    return FindName(m_variables, name);
}

inline size_t Kq_BoolEquationImp::FindVariable(const Kq_BoolEquation::Handle& handle) const
{
    if (handle.empty())
        return kNotFound;
    const size_t index = *handle.begin();
    return index < m_variables.size() ? index : kNotFound;
}

bool Kq_BoolEquationImp::DefineVariable(const String& name, unsigned int value)
{
    if (FindVariable(name) != kNotFound || name.length() == 0 || !IsLegalName(name))
        return false;
    const unsigned int variableIndex = GetNumVariables();
    m_variables.push_back(Variable(name, value ? 1u : 0u));
    m_store->LinkVariable(name, variableIndex);
    return true;
}

// The variables that the terms define, with value 0. A term that is not legal or stands twice is
// skipped.
std::vector<Variable> Kq_BoolEquationImp::ListTerms(const std::vector<String>& terms,
                                                    bool reverseTerms)
{
    std::vector<Variable> variables;
    variables.reserve(terms.size());
    NameIndex index(variables);
    for (size_t position = 0; position < terms.size(); ++position) {
        const String& name = terms[reverseTerms ? terms.size() - 1 - position : position];
        if (name.length() != 0 && IsLegalName(name) && index.Find(name) == kNotFound)
            variables.push_back(Variable(name, 0u));
    }
    return variables;
}

// Defines the name of every ID node that is no variable yet, with value 0 and in text order, and
// writes its variable's index into every ID node. The nodes are still in the order of 'tokens'.
void Kq_BoolEquationImp::DefineListedNames(const Tokens& tokens)
{
    assert(m_store->GetNodes().size() == tokens.GetSize());
    const bool hasListedTerms = !m_variables.empty();
    NameIndex terms(m_variables);
    PooledNames names;
    Node* const* node = m_store->GetNodes().data();
    for (const Tokens::Token& token : tokens) {
        Node* const idNode = *node++;
        if (token.type != Node::ID)
            continue;
        size_t& variableIndex = names.IndexOf(token.text);
        if (variableIndex == kNotFound && hasListedTerms)
            variableIndex = terms.Find(*token.text);
        if (variableIndex == kNotFound) {
            if (m_variables.capacity() == 0)
                m_variables.reserve(std::min<size_t>(tokens.GetSize(), kFirstVariables));
            variableIndex = m_variables.size();
            m_variables.push_back(Variable(*token.text, 0u));
        }
        idNode->SetValue(static_cast<unsigned int>(variableIndex));
    }
}

bool Kq_BoolEquationImp::IsVariableDefined(const String& name) const
{
    return FindVariable(name) != kNotFound;
}

// Deliberate: of a handle only the index counts, whatever equation it came from.
bool Kq_BoolEquationImp::IsVariableDefined(const Kq_BoolEquation::Handle& handle) const
{
    return FindVariable(handle) != kNotFound;
}

bool Kq_BoolEquationImp::SetVariable(const String& name, unsigned int value)
{
    const size_t index = FindVariable(name);
    if (index == kNotFound)
        return false;
    m_variables[index].second = value ? 1u : 0u;
    return true;
}

bool Kq_BoolEquationImp::SetVariable(const Kq_BoolEquation::Handle& handle, unsigned int value)
{
    const size_t index = FindVariable(handle);
    if (index == kNotFound)
        return false;
    m_variables[index].second = value ? 1u : 0u;
    return true;
}

unsigned int Kq_BoolEquationImp::GetVariable(const String& name) const
{
    const size_t index = FindVariable(name);
    return index == kNotFound ? 0u : m_variables[index].second;
}

unsigned int Kq_BoolEquationImp::GetVariable(const Kq_BoolEquation::Handle& handle) const
{
    const size_t index = FindVariable(handle);
    return index == kNotFound ? 0u : m_variables[index].second;
}

Kq_BoolEquation::Handle Kq_BoolEquationImp::GetVariableHandle(const String& name) const
{
    const size_t index = FindVariable(name);
    if (index == kNotFound)
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
