// Lists of packed cubes: order, containment, counts.
#include "cube.h"

#include <algorithm>
#include <numeric>

namespace booleq {

CubeSpace::CubeSpace(size_t numInputs, size_t numOutputs)
    : m_num_inputs(numInputs), m_num_outputs(numOutputs),
      m_num_input_words(std::max<size_t>(1, (2 * numInputs + 63) / 64))
{
    const size_t numBits = 2 * numInputs + numOutputs;
    const size_t numWords = std::max(m_num_input_words, (numBits + 63) / 64);
    m_input_low.resize(numWords);
    m_outputs.resize(numWords);
    m_all.resize(numWords);
    for (size_t bit = 0; bit < numBits; ++bit) {
        const uint64_t mask = uint64_t(1) << (bit % 64);
        m_all[bit / 64] |= mask;
        if (bit >= 2 * numInputs)
            m_outputs[bit / 64] |= mask;
        else if (bit % 2 == 0)
            m_input_low[bit / 64] |= mask;
    }
}

void CubeList::Append(const uint64_t* cube)
{
    const size_t end = m_words.size();
    const bool isOwn = cube >= m_words.data() && cube < m_words.data() + end;
    const size_t offset = isOwn ? static_cast<size_t>(cube - m_words.data()) : 0;
    m_words.resize(end + m_num_words);
    CopyCube(m_words.data() + end, isOwn ? m_words.data() + offset : cube, m_num_words);
}

void CubeList::Append(const CubeList& other)
{
    assert(&other != this);
    assert(other.m_num_words == m_num_words);
    m_words.insert(m_words.end(), other.m_words.begin(), other.m_words.end());
}

void CubeList::Keep(const std::vector<uint8_t>& isKept)
{
    assert(isKept.size() == Size());
    size_t numKept = 0;
    for (size_t index = 0; index < isKept.size(); ++index)
        if (isKept[index] != 0)
            CopyCube(At(numKept++), At(index), m_num_words);
    Resize(numKept);
}

void CubeList::Reorder(const std::vector<uint32_t>& order)
{
    assert(order.size() == Size());
    std::vector<uint64_t> words(m_words.size());
    for (size_t index = 0; index < order.size(); ++index)
        CopyCube(words.data() + index * m_num_words, At(order[index]), m_num_words);
    m_words.swap(words);
}

void CubeList::SortAndUnite()
{
    std::vector<uint32_t> order(Size());
    std::iota(order.begin(), order.end(), 0u);
    const auto isLess = [this](uint32_t left, uint32_t right) {
        return std::lexicographical_compare(At(left), At(left) + m_num_words, At(right),
                                            At(right) + m_num_words);
    };
    std::sort(order.begin(), order.end(), isLess);
    Reorder(order);
    std::vector<uint8_t> isFirst(Size(), 1);
    for (size_t index = 1; index < Size(); ++index)
        isFirst[index] = IsSameCube(At(index - 1), At(index), m_num_words) ? 0 : 1;
    Keep(isFirst);
}

int CompareInputs(const CubeSpace& space, const uint64_t* left, const uint64_t* right)
{
    for (size_t word = 0; word < space.NumInputWords(); ++word) {
        const uint64_t leftInputs = left[word] & space.Inputs(word);
        const uint64_t rightInputs = right[word] & space.Inputs(word);
        if (leftInputs != rightInputs)
            return leftInputs < rightInputs ? -1 : 1;
    }
    return 0;
}

size_t CountCubeLiterals(const CubeSpace& space, const uint64_t* cube)
{
    size_t numLiterals = 0;
    for (size_t word = 0; word < space.NumInputWords(); ++word)
        numLiterals += CountBits(~cube[word] & space.Inputs(word));
    return numLiterals;
}

size_t CountLiterals(const CubeSpace& space, const CubeList& cubes)
{
    size_t numLiterals = 0;
    for (size_t index = 0; index < cubes.Size(); ++index)
        numLiterals += CountCubeLiterals(space, cubes.At(index));
    return numLiterals;
}

size_t CountOutputs(const CubeSpace& space, const uint64_t* cube)
{
    size_t numOutputs = 0;
    for (size_t word = space.FirstOutputWord(); word < space.NumWords(); ++word)
        numOutputs += CountBits(cube[word] & space.Outputs(word));
    return numOutputs;
}

} // namespace booleq
