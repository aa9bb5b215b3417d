// Names of one design looked up in another one: nets and cells that are called the same.
// Two designs keep their names apart, so each name is looked up once, and then only numbers are.
// Cost: a look-up for each name and each scope; a vector of numbers for what stands at the top, a
// hash map for what stands in instances.
#ifndef BOOLEQ_INSPECT_NAME_MATCH_H
#define BOOLEQ_INSPECT_NAME_MATCH_H

#include <cstdint>
#include <unordered_map>
#include <vector>

#include "design.h"

namespace booleq {

constexpr uint32_t kNotThere = UINT32_MAX;

// Scoped names of a design and what they stand for.
class ScopedIndex {
  public:
    explicit ScopedIndex(const Design& design) : m_top(design.names.Size(), kNotThere) {}

    // The first one counts.
    void Add(const ScopedName& name, uint32_t value);
    // kNotThere, also for names that are kNotThere.
    uint32_t Find(const ScopedName& name) const;

  private:
    std::vector<uint32_t> m_top; // by name, of scope 0
    std::unordered_map<uint64_t, uint32_t> m_inner;
};

// Where names of design 'from' stand in design 'to'.
class NameMatch {
  public:
    NameMatch(const Design& from, const Design& to);

    NameId Find(NameId name) const { return m_names[name]; }
    // What the index of 'to' has for a scoped name of 'from'. The scopes need not be the same: a
    // flat design calls "a.b" what another one calls b in a.
    uint32_t Find(const ScopedName& name, const ScopedIndex& index) const;

  private:
    const Design& m_from;
    const Design& m_to;
    std::vector<NameId> m_names;    // by name of 'from'; kNotThere where 'to' lacks it
    std::vector<uint32_t> m_scopes; // the same for scopes
};

} // namespace booleq

#endif
