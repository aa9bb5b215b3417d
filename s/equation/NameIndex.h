// Where each name of a growing variable table is, for as long as an equation is being set.
#ifndef KQ_NAMEINDEX_H
#define KQ_NAMEINDEX_H

#include <cassert>
#include <cstdint>
#include <cstring>
#include <utility>
#include <vector>

#include "Name.h"

constexpr size_t kKqNotFound = SIZE_MAX;

// A hash table of positions, so that the time to set an equation with many names stays in step with
// its text. For few names it is inside the object, and a position is a byte.
// Invariants: 1. A table shows the position of every name that was added, and is at most half full.
// 2. The hashes of all names are in m_first or, once they are too many for it, in m_hashes.
class KqNameIndex {
  public:
    typedef std::pair<Port::StringBase<char>, unsigned int> Variable;

    // Knows the names that the table has now; later ones are added one by one.
    explicit KqNameIndex(const std::vector<Variable>& variables) : m_variables(variables)
    {
        std::memset(m_few, kFree, sizeof m_few);
        for (const Variable& variable : variables)
            Add(KqHashText(variable.first.c_str(), variable.first.length()));
    }

    // Position of the name, or kKqNotFound.
    size_t Find(const Port::StringBase<char>& name, uint64_t hash) const
    {
        const auto isName = [&](size_t position) { return IsAt(position, name, hash); };
        if (!m_slots.empty())
            return m_slots[SlotOf(m_slots.data(), m_slots.size(), kKqNotFound, hash, isName)];
        const uint8_t position = m_few[SlotOf(m_few, kFewSlots, kFree, hash, isName)];
        return position == kFree ? kKqNotFound : position;
    }

    // The table's next name, which is new.  Fails: std::bad_alloc.
    void Add(uint64_t hash)
    {
        if (m_size < kInline) {
            m_first[m_size] = hash;
            m_few[SlotOf(m_few, kFewSlots, kFree, hash, IsNone)] = static_cast<uint8_t>(m_size);
        } else {
            AddToHeap(hash);
        }
        ++m_size;
    }

  private:
    static constexpr size_t kInline = 16;
    static constexpr size_t kFewSlots = 64;
    static constexpr uint8_t kFree = 0xff;

    bool IsAt(size_t position, const Port::StringBase<char>& name, uint64_t hash) const
    {
        const uint64_t known = m_hashes.empty() ? m_first[position] : m_hashes[position];
        return known == hash &&
               KqIsNamed(m_variables[position].first, known, name.c_str(), name.length(), hash);
    }

    // For a name that is known to be new.
    static bool IsNone(size_t /*position*/) { return false; }

    // The slot of the position that 'isName' accepts, or the first free one on its way.
    // Requires: a power of two as the number of slots, one of them free.
    template <class Slot, class IsName>
    static size_t SlotOf(const Slot* slots, size_t numSlots, Slot free, uint64_t hash,
                         const IsName& isName)
    {
        size_t slot = static_cast<size_t>(hash) & (numSlots - 1);
        while (slots[slot] != free && !isName(slots[slot]))
            slot = (slot + 1) & (numSlots - 1);
        return slot;
    }

    void Place(size_t position)
    {
        m_slots[SlotOf(m_slots.data(), m_slots.size(), kKqNotFound, m_hashes[position], IsNone)] =
            position;
    }

    void AddToHeap(uint64_t hash)
    {
        if (m_size == kInline)
            m_hashes.assign(m_first, m_first + kInline);
        m_hashes.push_back(hash);
        if (m_slots.size() < 2 * m_hashes.size()) {
            m_slots.assign(m_slots.empty() ? 8 * kInline : 4 * m_slots.size(), kKqNotFound);
            for (size_t position = 0; position < m_hashes.size(); ++position)
                Place(position);
        } else {
            Place(m_hashes.size() - 1);
        }
        assert(m_hashes.size() == m_size + 1);
    }

    const std::vector<Variable>& m_variables;
    size_t m_size = 0;
    uint8_t m_few[kFewSlots]; // unused once there is a table on the heap
    uint64_t m_first[kInline];
    std::vector<uint64_t> m_hashes; // of all names, once they are too many for m_first
    std::vector<size_t> m_slots;
};

#endif
