#include "name_arena.h"

#include <cassert>
#include <cstring>
#include <stdexcept>

namespace booleq {

namespace {

constexpr size_t kFirstSlots = 1024;
constexpr uint64_t kMultiplier = 0x9e3779b97f4a7c15;

uint64_t Mix(uint64_t value)
{
    value ^= value >> 32;
    value *= kMultiplier;
    return value ^ value >> 29;
}

// Hashes eight bytes at a time: names in a netlist are long and similar.
uint64_t Hash(std::string_view name)
{
    uint64_t hash = name.size() * kMultiplier;
    size_t place = 0;
    for (; place + 8 <= name.size(); place += 8) {
        uint64_t word;
        std::memcpy(&word, name.data() + place, 8);
        hash = Mix(hash ^ word);
    }
    uint64_t rest = 0;
    if (place < name.size())
        std::memcpy(&rest, name.data() + place, name.size() - place);
    return Mix(hash ^ rest);
}

} // namespace

NameArena::NameArena() : m_ends(1, 0), m_slots(kFirstSlots, 0), m_hashes(1, 0) {}

// The slot of the name, or the free slot where it would go. Slots hold name numbers; 0, the empty
// name, is never stored.
size_t NameArena::SlotOf(std::string_view name, uint64_t hash) const
{
    const size_t mask = m_slots.size() - 1;
    size_t slot = static_cast<size_t>(hash) & mask;
    while (m_slots[slot] != 0) {
        const NameId other = m_slots[slot];
        if (m_hashes[other] == hash && Text(other) == name)
            return slot;
        slot = (slot + 1) & mask;
    }
    return slot;
}

NameId NameArena::Add(std::string_view name)
{
    if (name.empty())
        return 0;
    const uint64_t hash = Hash(name);
    size_t slot = SlotOf(name, hash);
    if (m_slots[slot] != 0)
        return m_slots[slot];
    if (m_ends.size() >= kNoName)
        throw std::length_error("too many names");
    if (m_ends.size() * 4 > m_slots.size() * 3) {
        Grow();
        slot = SlotOf(name, hash);
    }
    const auto id = static_cast<NameId>(m_ends.size());
    m_bytes.insert(m_bytes.end(), name.begin(), name.end());
    m_hashes.push_back(hash);
    m_ends.push_back(m_bytes.size());
    m_slots[slot] = id;
    assert(m_slots[slot] != 0);
    assert(Text(id) == name);
    return id;
}

NameId NameArena::Find(std::string_view name) const
{
    if (name.empty())
        return 0;
    const NameId id = m_slots[SlotOf(name, Hash(name))];
    return id == 0 ? kNoName : id;
}

void NameArena::Grow()
{
    Rehash(m_slots.size() * 2);
}

void NameArena::Rehash(size_t numSlots)
{
    assert((numSlots & (numSlots - 1)) == 0);
    std::vector<uint32_t> slots(numSlots, 0);
    const size_t mask = slots.size() - 1;
    for (NameId name = 1; name < m_ends.size(); ++name) {
        size_t slot = static_cast<size_t>(m_hashes[name]) & mask;
        while (slots[slot] != 0)
            slot = (slot + 1) & mask;
        slots[slot] = name;
    }
    m_slots = std::move(slots);
}

// The file of a large design has a new name about every 350 bytes. Memory that is reserved but
// never written is not used.
void NameArena::Reserve(uint64_t numBytes)
{
    const auto numNames = static_cast<size_t>(numBytes / 350);
    m_bytes.reserve(static_cast<size_t>(numBytes / 6));
    m_ends.reserve(numNames);
    m_hashes.reserve(numNames);
    size_t numSlots = m_slots.size();
    while (numSlots * 3 < numNames * 4)
        numSlots *= 2;
    if (numSlots != m_slots.size())
        Rehash(numSlots);
}

size_t NameArena::NumBytes() const
{
    return m_bytes.capacity() + m_ends.capacity() * sizeof(uint64_t) +
           m_slots.capacity() * sizeof(uint32_t) + m_hashes.capacity() * sizeof(uint64_t);
}

} // namespace booleq
