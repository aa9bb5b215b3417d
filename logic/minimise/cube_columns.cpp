// Transposes lists of cubes, 64 by 64 bits at a time, and finds the cubes that are near another
// one.
#include "cube_columns.h"

#include <algorithm>

namespace booleq {

namespace {

constexpr size_t kSide = 64;

// Exchanges bit k of word i with bit i of word k: halves first, then quarters, and so on.
void Transpose(uint64_t* words)
{
    uint64_t mask = 0x00000000ffffffffu;
    for (size_t width = kSide / 2; width != 0; width /= 2, mask ^= mask << width) {
        for (size_t row = 0; row < kSide; row = (row + width + 1) & ~width) {
            const uint64_t swapped = (words[row] >> width ^ words[row + width]) & mask;
            words[row] ^= swapped << width;
            words[row + width] ^= swapped;
        }
    }
}

} // namespace

CubeColumns::CubeColumns(const CubeSpace& space, const CubeList& cubes)
    : m_num_input_parts(2 * space.NumInputs()), m_num_parts(m_num_input_parts + space.NumOutputs()),
      m_num_blocks((cubes.Size() + kSide - 1) / kSide), m_columns(m_num_blocks * m_num_parts),
      m_cubes(m_num_blocks, ~uint64_t(0))
{
    uint64_t square[kSide];
    for (size_t block = 0; block < m_num_blocks; ++block) {
        const size_t first = block * kSide;
        const size_t count = std::min(kSide, cubes.Size() - first);
        if (count < kSide)
            m_cubes[block] = (uint64_t(1) << count) - 1;
        for (size_t part = 0; part < m_num_parts; part += kSide) {
            for (size_t index = 0; index < kSide; ++index)
                square[index] = index < count ? cubes.At(first + index)[part / kSide] : 0;
            Transpose(square);
            std::copy(square, square + std::min(kSide, m_num_parts - part),
                      m_columns.data() + block * m_num_parts + part);
        }
        assert(m_num_parts == 0 || (Block(block)[0] & 1u) == (cubes.At(first)[0] & 1u));
    }
}

void CubeColumns::Set(size_t index, const uint64_t* cube)
{
    assert(index / kSide < m_num_blocks);
    uint64_t* const columns = m_columns.data() + index / kSide * m_num_parts;
    const size_t place = index % kSide;
    for (size_t part = 0; part < m_num_parts; ++part) {
        const uint64_t bit = cube[part / kSide] >> (part % kSide) & 1u;
        columns[part] = (columns[part] & ~(uint64_t(1) << place)) | bit << place;
    }
}

bool ListColumns(const CubeSpace& space, const uint64_t* cube, ColumnsToMeet& columns)
{
    columns.inputs.clear();
    columns.outputs.clear();
    for (size_t word = 0; word < space.NumWords(); ++word) {
        const uint64_t low = space.InputLow(word);
        const uint64_t high = cube[word] >> 1;
        if (((cube[word] | high) & low) != low)
            return false;
        const uint64_t open = (cube[word] & high & low) * 3;
        AppendBits(cube[word] & space.Inputs(word) & ~open, word, columns.inputs);
        AppendBits(cube[word] & space.Outputs(word), word, columns.outputs);
    }
    return true;
}

CubeIndex::CubeIndex(const CubeSpace& space, const CubeList& cubes)
    : m_space(space), m_cubes(cubes), m_columns(space, cubes)
{
}

void CubeIndex::Find(const uint64_t* cube, size_t maxDistance, Work& work,
                     std::vector<uint32_t>& found)
{
    assert(maxDistance <= 1);
    found.clear();
    if (!ListColumns(m_space, cube, m_to_meet))
        return;
    work.Spend(m_columns.NumBlocks() * (m_to_meet.inputs.size() + m_to_meet.outputs.size()) / 2);
    for (size_t block = 0; block < m_columns.NumBlocks(); ++block) {
        if (maxDistance == 0) {
            AppendBits(MeetingInBlock(m_columns, block, m_to_meet), block, found);
            continue;
        }
        const uint64_t* const columns = m_columns.Block(block);
        uint64_t one = ~AnyColumn(columns, m_to_meet.outputs);
        uint64_t two = 0;
        for (const uint32_t part : m_to_meet.inputs) {
            two |= one & ~columns[part];
            one |= ~columns[part];
        }
        AppendBits(m_columns.Cubes(block) & ~two, block, found);
    }
}

void RemoveContained(const CubeSpace& space, CubeList& cubes, Work& work)
{
    const CubeColumns columns(space, cubes);
    std::vector<uint8_t> isKept(cubes.Size(), 1);
    std::vector<uint32_t> parts; // outputs first: few cubes have a given output
    for (size_t index = 0; index < cubes.Size(); ++index) {
        const uint64_t* cube = cubes.At(index);
        parts.clear();
        for (size_t word = space.NumWords(); word-- > 0;)
            AppendBits(cube[word] & space.Outputs(word), word, parts);
        for (size_t word = 0; word < space.NumWords(); ++word)
            AppendBits(cube[word] & space.Inputs(word), word, parts);
        work.Spend(columns.NumBlocks() * 4 + 1);
        for (size_t block = 0; block < columns.NumBlocks() && isKept[index] != 0; ++block) {
            uint64_t holders = columns.Cubes(block);
            for (size_t place = 0; place < parts.size() && holders != 0; ++place)
                holders &= columns.Block(block)[parts[place]];
            for (; holders != 0; holders &= holders - 1) {
                const size_t holder = block * kSide + LowestBit(holders);
                const bool isEqual = IsSameCube(cubes.At(holder), cube, space.NumWords());
                if (!isEqual || holder < index)
                    isKept[index] = 0;
            }
        }
    }
    cubes.Keep(isKept);
}

} // namespace booleq
