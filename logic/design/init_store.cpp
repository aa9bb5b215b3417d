#include "init_store.h"

#include <algorithm>
#include <cassert>

namespace booleq {

namespace {

uint64_t Mixed(uint64_t hash, uint64_t word)
{
    hash = (hash ^ word) * 0x9e3779b97f4a7c15;
    return hash ^ hash >> 31;
}

uint64_t Hash(unsigned int numInputs, const uint64_t* words, const uint64_t* unknown)
{
    uint64_t hash = numInputs + (unknown != nullptr ? 64u : 0u);
    for (size_t word = 0; word < NumWords(numInputs); ++word)
        hash = Mixed(hash, words[word]);
    for (size_t word = 0; unknown != nullptr && word < NumWords(numInputs); ++word)
        hash = Mixed(hash, unknown[word]);
    return hash;
}

} // namespace

InitStore::InitStore(Design& design) : m_design(design), m_slots(256, 0)
{
    assert(design.inits.empty());
}

bool InitStore::IsSame(InitId init, unsigned int numInputs, const uint64_t* words,
                       const uint64_t* unknown) const
{
    const InitValue& value = m_design.inits[init];
    if (value.numInputs != numInputs || value.hasUnknown != (unknown != nullptr))
        return false;
    const size_t numWords = NumWords(numInputs);
    const uint64_t* own = m_design.Words(value);
    return std::equal(own, own + numWords, words) &&
           (unknown == nullptr || std::equal(own + numWords, own + 2 * numWords, unknown));
}

bool InitStore::Add(unsigned int numInputs, const uint64_t* words, const uint64_t* unknown,
                    InitId& init)
{
    assert(numInputs <= kMaxTableInputs);
    if ((m_design.inits.size() + 1) * 4 > m_slots.size() * 3)
        Grow();
    const size_t mask = m_slots.size() - 1;
    size_t slot = static_cast<size_t>(Hash(numInputs, words, unknown)) & mask;
    for (; m_slots[slot] != 0; slot = (slot + 1) & mask)
        if (IsSame(m_slots[slot] - 1, numInputs, words, unknown)) {
            init = m_slots[slot] - 1;
            return true;
        }
    const size_t numWords = NumWords(numInputs);
    const size_t numNewWords = unknown != nullptr ? 2 * numWords : numWords;
    if ((m_design.words.size() + numNewWords) * sizeof(uint64_t) > kMaxInitBytes)
        return false;
    InitValue value;
    value.firstWord = static_cast<uint32_t>(m_design.words.size());
    value.numInputs = static_cast<uint8_t>(numInputs);
    value.hasUnknown = unknown != nullptr;
    m_design.words.insert(m_design.words.end(), words, words + numWords);
    if (unknown != nullptr)
        m_design.words.insert(m_design.words.end(), unknown, unknown + numWords);
    m_design.inits.push_back(value);
    m_slots[slot] = static_cast<uint32_t>(m_design.inits.size());
    init = m_slots[slot] - 1;
    return true;
}

void InitStore::Grow()
{
    std::vector<uint32_t> slots(m_slots.size() * 2, 0);
    const size_t mask = slots.size() - 1;
    for (uint32_t init = 0; init < m_design.inits.size(); ++init) {
        const InitValue& value = m_design.inits[init];
        const uint64_t* words = m_design.Words(value);
        const uint64_t* unknown = value.hasUnknown ? words + NumWords(value.numInputs) : nullptr;
        size_t slot = static_cast<size_t>(Hash(value.numInputs, words, unknown)) & mask;
        while (slots[slot] != 0)
            slot = (slot + 1) & mask;
        slots[slot] = init + 1;
    }
    m_slots = std::move(slots);
}

} // namespace booleq
