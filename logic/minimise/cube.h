// Cubes of several-output functions, packed: two bits for each input, one for each output.
// An input's pair is 01 for the value 0, 10 for 1, 11 for either (low bit first: bit 0 admits 0,
// bit 1 admits 1); a pair 00 makes the cube empty. Inputs come first and outputs follow without a
// gap; bits above the last output are 0. A pair never crosses a word boundary.
#ifndef BOOLEQ_MINIMISE_CUBE_H
#define BOOLEQ_MINIMISE_CUBE_H

#include <cassert>
#include <cstddef>
#include <cstdint>
#include <vector>

#include "work.h"

namespace booleq {

constexpr uint64_t kLowBits = 0x5555555555555555u;

// Not the compiler's builtin: without a processor option, that calls its library.
inline size_t CountBits(uint64_t word)
{
    word -= word >> 1 & kLowBits;
    word = (word & 0x3333333333333333u) + (word >> 2 & 0x3333333333333333u);
    word = (word + (word >> 4)) & 0x0f0f0f0f0f0f0f0fu;
    return static_cast<size_t>(word * 0x0101010101010101u >> 56);
}

inline size_t LowestBit(uint64_t word)
{
    assert(word != 0);
    return static_cast<size_t>(__builtin_ctzll(word));
}

// How many inputs and outputs there are, and which bits of a cube's words belong to them.
class CubeSpace {
  public:
    CubeSpace(size_t numInputs, size_t numOutputs);

    size_t NumInputs() const { return m_num_inputs; }
    size_t NumOutputs() const { return m_num_outputs; }
    size_t NumWords() const { return m_all.size(); }
    // Words that hold any input; at least one.
    size_t NumInputWords() const { return m_num_input_words; }
    // The first word that holds an output.
    size_t FirstOutputWord() const { return 2 * m_num_inputs / 64; }
    // The low bit of each input's pair in a word; both bits; the outputs' bits; and all bits in
    // use.
    uint64_t InputLow(size_t word) const { return m_input_low[word]; }
    uint64_t Inputs(size_t word) const { return m_input_low[word] * 3; }
    uint64_t Outputs(size_t word) const { return m_outputs[word]; }
    uint64_t All(size_t word) const { return m_all[word]; }
    size_t OutputBit(size_t output) const { return 2 * m_num_inputs + output; }

  private:
    size_t m_num_inputs;
    size_t m_num_outputs;
    size_t m_num_input_words;
    std::vector<uint64_t> m_input_low;
    std::vector<uint64_t> m_outputs;
    std::vector<uint64_t> m_all;
};

// Cubes of one width, in one block. Invariant: m_words.size() is a multiple of m_num_words.
class CubeList {
  public:
    explicit CubeList(size_t numWords) : m_num_words(numWords) { assert(numWords > 0); }

    size_t Size() const { return m_words.size() / m_num_words; }
    bool IsEmpty() const { return m_words.empty(); }
    size_t NumWords() const { return m_num_words; }
    // Valid until the next Append, Resize or Keep.
    uint64_t* At(size_t index) { return m_words.data() + index * m_num_words; }
    const uint64_t* At(size_t index) const { return m_words.data() + index * m_num_words; }

    // 'cube' may be a cube of this list.
    void Append(const uint64_t* cube);
    void Append(const CubeList& other);
    // Drops the cubes after the first 'count'; new cubes have all words 0.
    void Resize(size_t count) { m_words.resize(count * m_num_words); }
    void Reserve(size_t count) { m_words.reserve(count * m_num_words); }
    // Drops the cubes whose flag is 0; the others keep their order.
    void Keep(const std::vector<uint8_t>& isKept);
    void Reorder(const std::vector<uint32_t>& order);
    // Sorts the cubes by their words, and keeps one of equal ones.
    void SortAndUnite();

  private:
    size_t m_num_words;
    std::vector<uint64_t> m_words;
};

inline bool GetBit(const uint64_t* cube, size_t bit)
{
    return (cube[bit / 64] >> (bit % 64) & 1u) != 0;
}

inline void SetBit(uint64_t* cube, size_t bit)
{
    cube[bit / 64] |= uint64_t(1) << (bit % 64);
}

inline void ClearBit(uint64_t* cube, size_t bit)
{
    cube[bit / 64] &= ~(uint64_t(1) << (bit % 64));
}

inline void CopyCube(uint64_t* target, const uint64_t* source, size_t numWords)
{
    for (size_t word = 0; word < numWords; ++word)
        target[word] = source[word];
}

inline bool IsSameCube(const uint64_t* left, const uint64_t* right, size_t numWords)
{
    uint64_t differences = 0;
    for (size_t word = 0; word < numWords; ++word)
        differences |= left[word] ^ right[word];
    return differences == 0;
}

// Whether 'outer' has every part that 'inner' has.
inline bool Contains(const uint64_t* outer, const uint64_t* inner, size_t numWords)
{
    for (size_t word = 0; word < numWords; ++word)
        if ((inner[word] & ~outer[word]) != 0)
            return false;
    return true;
}

// The low bits of the inputs of a word in which the two cubes have no value in common.
inline uint64_t InputConflicts(const CubeSpace& space, const uint64_t* left, const uint64_t* right,
                               size_t word)
{
    const uint64_t common = left[word] & right[word];
    return space.InputLow(word) & ~(common | common >> 1);
}

inline bool HasCommonOutput(const CubeSpace& space, const uint64_t* left, const uint64_t* right)
{
    for (size_t word = space.FirstOutputWord(); word < space.NumWords(); ++word)
        if ((left[word] & right[word] & space.Outputs(word)) != 0)
            return true;
    return false;
}

inline bool HasCommonInputs(const CubeSpace& space, const uint64_t* left, const uint64_t* right)
{
    for (size_t word = 0; word < space.NumInputWords(); ++word)
        if (InputConflicts(space, left, right, word) != 0)
            return false;
    return true;
}

inline bool IsDisjoint(const CubeSpace& space, const uint64_t* left, const uint64_t* right)
{
    return !HasCommonInputs(space, left, right) || !HasCommonOutput(space, left, right);
}

// How many inputs have no common value, plus one if there is no common output.
inline size_t Distance(const CubeSpace& space, const uint64_t* left, const uint64_t* right)
{
    size_t distance = HasCommonOutput(space, left, right) ? 0 : 1;
    for (size_t word = 0; word < space.NumInputWords(); ++word)
        distance += CountBits(InputConflicts(space, left, right, word));
    return distance;
}

// Compares the cubes' inputs: negative, 0 or positive, a total order.
int CompareInputs(const CubeSpace& space, const uint64_t* left, const uint64_t* right);
// The number of inputs that the cube fixes.
size_t CountCubeLiterals(const CubeSpace& space, const uint64_t* cube);
size_t CountLiterals(const CubeSpace& space, const CubeList& cubes);
size_t CountOutputs(const CubeSpace& space, const uint64_t* cube);

} // namespace booleq

#endif
