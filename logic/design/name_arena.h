// The names of a design. Each distinct one is kept once, in one block of bytes, and has a number.
// Fails: std::bad_alloc; std::length_error for more than 2^32 - 1 names.
// Cost: a look-up takes one probe or two; a name takes its bytes and about 16 more.
#ifndef BOOLEQ_DESIGN_NAME_ARENA_H
#define BOOLEQ_DESIGN_NAME_ARENA_H

#include <cstdint>
#include <string>
#include <string_view>
#include <vector>

namespace booleq {

typedef uint32_t NameId; // 0 is the empty name

// Invariants:
// 1. Name k has the bytes from m_ends[k - 1] to m_ends[k]; name 0 is empty.
// 2. The number of slots is a power of two, and at most three quarters are used. A slot is 0 or a
//    name.
class NameArena {
  public:
    static constexpr NameId kNoName = UINT32_MAX;

    NameArena();

    // Reserves room for the names of a text of this many bytes. Optional: the arena also grows on
    // demand.
    void Reserve(uint64_t numBytes);

    // The number of a name; a new one if the name is new.
    NameId Add(std::string_view name);
    // The number of a name; kNoName if it is not known.
    NameId Find(std::string_view name) const;
    // Valid until the next Add.  Requires: name < Size().
    std::string_view Text(NameId name) const
    {
        const auto start = static_cast<size_t>(name == 0 ? 0 : m_ends[name - 1]);
        return std::string_view(m_bytes.data() + start, static_cast<size_t>(m_ends[name]) - start);
    }
    size_t Size() const { return m_ends.size(); }
    size_t NumBytes() const;

  private:
    size_t SlotOf(std::string_view name, uint64_t hash) const;
    void Grow();
    void Rehash(size_t numSlots);

    std::vector<char> m_bytes;
    std::vector<uint64_t> m_ends;
    std::vector<uint32_t> m_slots;
    std::vector<uint64_t> m_hashes; // of each name, so that growing reads no bytes
};

} // namespace booleq

#endif
