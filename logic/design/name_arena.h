// Names of a design: each different one is kept once, in one block of bytes, and is a number.
// Fails: std::bad_alloc, std::length_error above 2^32 - 1 names or bytes of one block of 2^32.
// Cost: a look-up of one probe or two; a name takes its bytes and some 16 more.
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
// 2. m_slots has a power of two of elements, at most three quarters used; one is 0 or a name.
class NameArena {
  public:
    static constexpr NameId kNoName = UINT32_MAX;

    NameArena();

    // Makes room for what a text of so many bytes may have; without it, the arena grows by itself.
    void Reserve(uint64_t numBytes);

    // The number of a name, a new one where it is not there.
    NameId Add(std::string_view name);
    // kNoName where it is not there.
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
