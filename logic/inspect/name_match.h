// Looks up names of one design in another: nets and cells that have the same name. Each design has
// its own names, so each name is looked up once as text, and after that only by number.
// Cost: a look-up for each name and each scope; a vector for names at the top, a hash map for names
// in instances.
#ifndef BOOLEQ_INSPECT_NAME_MATCH_H
#define BOOLEQ_INSPECT_NAME_MATCH_H

#include <cstdint>
#include <unordered_map>
#include <vector>

#include "design.h"

namespace booleq {

constexpr uint32_t kNotThere = UINT32_MAX;

// Maps the scoped names of a design to values.
class ScopedIndex {
  public:
    explicit ScopedIndex(const Design& design) : m_top(design.names.Size(), kNotThere) {}

    // If a name is added twice, the first value counts.
    void Add(const ScopedName& name, uint32_t value);
    // kNotThere if the name is not known or is itself kNotThere.
    uint32_t Find(const ScopedName& name) const;

  private:
    std::vector<uint32_t> m_top; // by name, for scope 0
    std::unordered_map<uint64_t, uint32_t> m_inner;
};

// Maps the names of design 'from' to those of design 'to'.
class NameMatch {
  public:
    NameMatch(const Design& from, const Design& to);

    NameId Find(NameId name) const { return m_names[name]; }
    // The value that the index of 'to' has for a scoped name of 'from'. The scopes may differ: what
    // one design calls b in instance a, a flat one calls "a.b".
    uint32_t Find(const ScopedName& name, const ScopedIndex& index) const;

  private:
    const Design& m_from;
    const Design& m_to;
    std::vector<NameId> m_names;    // by name of 'from'; kNotThere if 'to' lacks it
    std::vector<uint32_t> m_scopes; // the same for scopes
};

} // namespace booleq

#endif
