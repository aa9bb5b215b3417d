// EXPAND if the off-set is too large to be written down: whether a cube may have a part is checked
// against what is on and free (R. Brayton, G. Hachtel, C. McMullen, A. Sangiovanni-Vincentelli,
// Logic Minimization Algorithms for VLSI Synthesis, 1984).
#include <algorithm>

#include "expand.h"

namespace booleq {

namespace {

constexpr size_t kMaxCubesToTakeIn = 64; // each needs a tautology check

} // namespace

// A part that the cube cannot have now it cannot have later, so trying each once makes a prime.
// Requires: m_free has the parts that may be tried, m_candidates the cubes to grow towards.
void Expander::ExpandByTautology(uint64_t* cube, const CubeList& others)
{
    TakeInNearest(cube, others);
    m_counts.assign(64 * m_num_words, 0);
    for (const uint32_t candidate : m_candidates)
        for (size_t word = 0; word < m_num_words; ++word)
            for (uint64_t rest = others.At(candidate)[word] & m_free[word]; rest != 0;
                 rest &= rest - 1)
                ++m_counts[64 * word + LowestBit(rest)];
    std::vector<uint32_t> bits;
    for (size_t word = 0; word < m_num_words; ++word)
        for (uint64_t rest = m_free[word] & ~cube[word]; rest != 0; rest &= rest - 1)
            bits.push_back(static_cast<uint32_t>(64 * word + LowestBit(rest)));
    std::stable_sort(bits.begin(), bits.end(), [this](uint32_t left, uint32_t right) {
        return m_counts[left] > m_counts[right];
    });
    for (const uint32_t bit : bits) {
        CopyCube(m_scratch.data(), cube, m_num_words);
        SetBit(m_scratch.data(), bit);
        if (IsImplicant(m_scratch.data()))
            SetBit(cube, bit);
    }
    assert(IsImplicant(cube));
}

// Takes in the nearest of the candidates, as long as the cube stays an implicant.
void Expander::TakeInNearest(uint64_t* cube, const CubeList& others)
{
    std::vector<std::pair<size_t, uint32_t>> order; // parts to raise, candidate
    m_work.Spend(m_candidates.size() * m_num_words);
    for (const uint32_t candidate : m_candidates) {
        size_t numRaised = 0;
        bool isReachable = true;
        for (size_t word = 0; word < m_num_words; ++word) {
            const uint64_t missing = others.At(candidate)[word] & ~cube[word];
            numRaised += CountBits(missing);
            isReachable = isReachable && (missing & ~m_free[word]) == 0;
        }
        if (isReachable)
            order.emplace_back(numRaised, candidate);
    }
    const size_t numTried = std::min(order.size(), kMaxCubesToTakeIn);
    std::partial_sort(order.begin(), order.begin() + static_cast<long>(numTried), order.end());
    for (size_t place = 0; place < numTried; ++place) {
        const uint64_t* other = others.At(order[place].second);
        if (Contains(cube, other, m_num_words))
            continue;
        for (size_t word = 0; word < m_num_words; ++word)
            m_scratch[word] = cube[word] | other[word];
        if (IsImplicant(m_scratch.data()))
            CopyCube(cube, m_scratch.data(), m_num_words);
    }
}

} // namespace booleq
