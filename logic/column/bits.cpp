#include "bits.h"

#include <algorithm>

#include "word_function.h"

namespace booleq {

bool Bits::IsZero() const
{
    return std::all_of(m_words.begin(), m_words.end(), [](uint64_t word) { return word == 0; });
}

bool Bits::IsOne() const
{
    const uint64_t ones = RowMask();
    return std::all_of(m_words.begin(), m_words.end(),
                       [ones](uint64_t word) { return word == ones; });
}

uint64_t Bits::NumOnes() const
{
    uint64_t count = 0;
    for (const uint64_t word : m_words)
        count += static_cast<uint64_t>(__builtin_popcountll(word));
    return count;
}

bool Bits::DependsOn(unsigned int input) const
{
    return Cofactor(input, false) != Cofactor(input, true);
}

std::vector<unsigned int> Bits::Support() const
{
    std::vector<unsigned int> support;
    for (unsigned int input = 0; input < m_num_inputs; ++input)
        if (DependsOn(input))
            support.push_back(input);
    return support;
}

Bits Bits::Cofactor(unsigned int input, bool value) const
{
    Bits result(*this);
    const unsigned int bit = m_num_inputs - 1 - input; // of the row number
    if (bit < 6) {
        const uint64_t rows = InputWord(m_num_inputs, input, 0);
        const unsigned int distance = 1u << bit;
        for (uint64_t& word : result.m_words) {
            const uint64_t kept = word & (value ? rows : ~rows);
            word = value ? kept | kept >> distance : kept | kept << distance;
        }
        return result;
    }
    const size_t step = size_t(1) << (bit - 6);
    for (size_t word = 0; word < m_words.size(); ++word)
        result.m_words[word] = m_words[value ? word | step : word & ~step];
    return result;
}

Bits Bits::operator~() const
{
    Bits result(*this);
    for (uint64_t& word : result.m_words)
        word = ~word & RowMask();
    return result;
}

Bits Bits::operator&(const Bits& other) const
{
    Bits result(*this);
    for (size_t word = 0; word < m_words.size(); ++word)
        result.m_words[word] &= other.m_words[word];
    return result;
}

Bits Bits::operator|(const Bits& other) const
{
    Bits result(*this);
    for (size_t word = 0; word < m_words.size(); ++word)
        result.m_words[word] |= other.m_words[word];
    return result;
}

Bits Bits::operator^(const Bits& other) const
{
    Bits result(*this);
    for (size_t word = 0; word < m_words.size(); ++word)
        result.m_words[word] ^= other.m_words[word];
    return result;
}

Bits Bits::OfInput(unsigned int numInputs, unsigned int input)
{
    Bits result(numInputs, std::vector<uint64_t>(numInputs > 6 ? size_t(1) << (numInputs - 6) : 1));
    for (size_t word = 0; word < result.m_words.size(); ++word)
        result.m_words[word] = InputWord(numInputs, input, word) & result.RowMask();
    return result;
}

} // namespace booleq
