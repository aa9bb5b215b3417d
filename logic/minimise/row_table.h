// Tables with so few inputs that each row can be visited: for each row a mask of outputs. A
// question between cubes then becomes a look at the rows that they hold.
#ifndef BOOLEQ_MINIMISE_ROW_TABLE_H
#define BOOLEQ_MINIMISE_ROW_TABLE_H

#include "pla.h"

namespace booleq {

// Bit k of a row's number is the value of input k, bit k of a mask stands for output k.
// Invariant: needed[row] lies in allowed[row].
struct RowTable {
    size_t numInputs = 0;
    size_t numOutputs = 0;
    std::vector<uint64_t> needed;  // the outputs that must be 1
    std::vector<uint64_t> allowed; // the outputs that may be 1
};

// Whether the rows are few enough, in all or for the number of cubes in the table: up to 16 inputs,
// or up to 20 and no more than 128 rows for each cube. So rows never cost much more than the text
// did.
bool CanListRows(const Pla& table);

// The rows of a table that does not contradict itself; if 'isInverted', of the inverted functions.
// Requires: CanListRows(table).  Cost: the rows of each cube.
RowTable ListRows(const Pla& table, bool isInverted, Work& work);

// A cube as its open inputs, the values of the others, and its outputs.
struct RowCube {
    uint32_t open;
    uint32_t values; // 0 where an input is open
    uint64_t outputs;
};

RowCube ToRowCube(const CubeSpace& space, const uint64_t* cube);
void FromRowCube(const CubeSpace& space, const RowCube& rows, uint64_t* cube);

inline size_t NumRowsOf(const RowCube& cube)
{
    return size_t(1) << CountBits(cube.open);
}

// Calls 'visit' with the number of each row of the cube.
template <typename Visit>
void ForEachRow(const RowCube& cube, const Visit& visit)
{
    uint32_t part = 0;
    do {
        visit(cube.values | part);
        part = (part - cube.open) & cube.open;
    } while (part != 0);
}

// Whether the sum has all rows that it needs and only rows that it may have.
bool IsSumOfRows(const CubeSpace& space, const RowTable& rows, const CubeList& sum, Work& work);

} // namespace booleq

#endif
