// Tables of so few inputs, or so many rows, that each row can be gone through: for each row a mask
// of outputs. What cubes ask of one another is then a look at the rows that they hold.
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
    std::vector<uint64_t> allowed; // those that may be 1
};

// Whether the rows are few, or few for the cubes that the table has: up to 16 inputs, or up to 20
// and no more than 128 rows for a cube. So rows never cost more than the text did by much.
bool CanListRows(const Pla& table);

// The rows of a table that does not contradict itself; 'isInverted': of the inverted functions.
// Requires: CanListRows(table).  Cost: each cube's rows.
RowTable ListRows(const Pla& table, bool isInverted, Work& work);

// Inputs that are open, values of the others, outputs.
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

// Whether the sum has all rows that it needs and none that it may not have.
bool IsSumOfRows(const CubeSpace& space, const RowTable& rows, const CubeList& sum, Work& work);

} // namespace booleq

#endif
