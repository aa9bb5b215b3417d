#include "name_match.h"

#include <cassert>

namespace booleq {

namespace {

uint64_t KeyOf(const ScopedName& name)
{
    return uint64_t(name.scope) << 32 | name.name;
}

} // namespace

void ScopedIndex::Add(const ScopedName& name, uint32_t value)
{
    if (name.scope != 0) {
        m_inner.emplace(KeyOf(name), value);
        return;
    }
    assert(name.name < m_top.size());
    if (m_top[name.name] == kNotThere)
        m_top[name.name] = value;
}

uint32_t ScopedIndex::Find(const ScopedName& name) const
{
    if (name.scope == kNotThere || name.name == kNotThere)
        return kNotThere;
    if (name.scope == 0)
        return name.name < m_top.size() ? m_top[name.name] : kNotThere;
    const auto found = m_inner.find(KeyOf(name));
    return found == m_inner.end() ? kNotThere : found->second;
}

NameMatch::NameMatch(const Design& from, const Design& to)
    : m_from(from), m_to(to), m_names(from.names.Size()), m_scopes(from.scopes.size(), kNotThere)
{
    for (NameId name = 0; name < m_names.size(); ++name) {
        const NameId found = to.names.Find(from.names.Text(name));
        m_names[name] = found == NameArena::kNoName ? kNotThere : found;
    }
    ScopedIndex scopes(to);
    for (ScopeId scope = 1; scope < to.scopes.size(); ++scope)
        scopes.Add({to.scopes[scope].parent, to.scopes[scope].name}, scope);
    m_scopes[0] = 0;
    for (ScopeId scope = 1; scope < from.scopes.size(); ++scope) {
        const DesignScope& own = from.scopes[scope];
        assert(own.parent < scope);
        m_scopes[scope] = scopes.Find({m_scopes[own.parent], m_names[own.name]});
    }
}

uint32_t NameMatch::Find(const ScopedName& name, const ScopedIndex& index) const
{
    const uint32_t found = index.Find({m_scopes[name.scope], m_names[name.name]});
    if (found != kNotThere || name.scope == 0)
        return found;
    const NameId flat = m_to.names.Find(Path(m_from, name));
    return flat == NameArena::kNoName ? kNotThere : index.Find({0, flat});
}

} // namespace booleq
