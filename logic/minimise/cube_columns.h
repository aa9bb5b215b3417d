// The cubes of a list, transposed: for each block of 64 cubes and each part, a word that says which
// of the cubes have it. A question to all cubes then takes one operation for each block and part in
// question, not several for each cube.
#ifndef BOOLEQ_MINIMISE_CUBE_COLUMNS_H
#define BOOLEQ_MINIMISE_CUBE_COLUMNS_H

#include "cube.h"
#include "work.h"

namespace booleq {

class CubeColumns {
  public:
    CubeColumns(const CubeSpace& space, const CubeList& cubes);

    size_t NumInputParts() const { return m_num_input_parts; }
    size_t NumParts() const { return m_num_parts; }
    size_t NumBlocks() const { return m_num_blocks; }
    // A word for each part, in the order of a cube's bits; bit k is for cube 64 * block + k.
    const uint64_t* Block(size_t block) const { return m_columns.data() + block * m_num_parts; }
    // The bits that stand for cubes: all 64, except perhaps in the last block.
    uint64_t Cubes(size_t block) const { return m_cubes[block]; }
    // Replaces the cube at 'index' by 'cube'.
    void Set(size_t index, const uint64_t* cube);

  private:
    size_t m_num_input_parts;
    size_t m_num_parts;
    size_t m_num_blocks;
    std::vector<uint64_t> m_columns;
    std::vector<uint64_t> m_cubes;
};

// The columns that matter for finding the cubes that meet one cube.
struct ColumnsToMeet {
    std::vector<uint32_t> inputs;  // one for each input that the cube fixes: others miss it
    std::vector<uint32_t> outputs; // cubes with none of these miss it too
};

// Fails: false, for a cube that has no value for some input and so meets no cube.
bool ListColumns(const CubeSpace& space, const uint64_t* cube, ColumnsToMeet& columns);

// Appends the positions of the bits of word 'word' of a cube, or of block 'word' of a list.
inline void AppendBits(uint64_t bits, size_t word, std::vector<uint32_t>& places)
{
    for (; bits != 0; bits &= bits - 1)
        places.push_back(static_cast<uint32_t>(64 * word + LowestBit(bits)));
}

inline uint64_t AnyColumn(const uint64_t* columns, const std::vector<uint32_t>& parts)
{
    uint64_t any = 0;
    for (const uint32_t part : parts)
        any |= columns[part];
    return any;
}

// The cubes of a block that meet the cube of 'columns'.
inline uint64_t MeetingInBlock(const CubeColumns& cubes, size_t block, const ColumnsToMeet& columns)
{
    const uint64_t* const words = cubes.Block(block);
    uint64_t meeting = cubes.Cubes(block);
    for (size_t place = 0; place < columns.inputs.size() && meeting != 0; ++place)
        meeting &= words[columns.inputs[place]];
    return meeting == 0 ? 0 : meeting & AnyColumn(words, columns.outputs);
}

// A list that is asked many times which of its cubes are near another cube. The list must outlive
// this. Call Update after changing one of its cubes; do not add or remove cubes.
class CubeIndex {
  public:
    CubeIndex(const CubeSpace& space, const CubeList& cubes);

    const CubeList& Cubes() const { return m_cubes; }
    const CubeColumns& Columns() const { return m_columns; }
    void Update(size_t index) { m_columns.Set(index, m_cubes.At(index)); }
    // The places, in ascending order, of cubes that have a row of an output in common with 'cube',
    // or with 'maxDistance' 1 of those that are at most one part away. Replaces 'found'.
    void Find(const uint64_t* cube, size_t maxDistance, Work& work, std::vector<uint32_t>& found);

  private:
    const CubeSpace& m_space;
    const CubeList& m_cubes;
    CubeColumns m_columns;
    ColumnsToMeet m_to_meet;
};

// Removes cubes that lie in another one of the list; of equal ones the first stays.
void RemoveContained(const CubeSpace& space, CubeList& cubes, Work& work);

} // namespace booleq

#endif
