// From cubes to rows, and the proof of a sum by its rows.
#include "row_table.h"

#include <algorithm>

namespace booleq {

namespace {

constexpr size_t kFewInputs = 16;
constexpr size_t kMaxRowInputs = 20;
constexpr size_t kMaxRowsForCube = 128;
constexpr size_t kMaxOutputs = 64;            // bits of a mask
constexpr size_t kMaxPairs = size_t(1) << 24; // pairs of row and output
constexpr double kMaxVisits = 64;             // to each row, on average

double CountRows(const CubeSpace& space, const CubeList& cubes)
{
    double numRows = 0;
    for (size_t index = 0; index < cubes.Size(); ++index) {
        const size_t numLiterals = CountCubeLiterals(space, cubes.At(index));
        numRows += static_cast<double>(size_t(1) << (space.NumInputs() - numLiterals));
    }
    return numRows;
}

void AddRows(const CubeSpace& space, const CubeList& cubes, std::vector<uint64_t>& masks,
             Work& work)
{
    for (size_t index = 0; index < cubes.Size(); ++index) {
        const RowCube cube = ToRowCube(space, cubes.At(index));
        work.Spend(NumRowsOf(cube));
        ForEachRow(cube, [&](uint32_t row) { masks[row] |= cube.outputs; });
    }
}

} // namespace

bool CanListRows(const Pla& table)
{
    const CubeSpace& space = table.space;
    if (space.NumInputs() > kMaxRowInputs || space.NumOutputs() > kMaxOutputs ||
        space.NumOutputs() == 0)
        return false;
    const size_t numRows = size_t(1) << space.NumInputs();
    if (numRows * space.NumOutputs() > kMaxPairs)
        return false;
    const size_t numCubes = table.on.Size() + table.free.Size() + table.off.Size();
    if (space.NumInputs() > kFewInputs && numRows > kMaxRowsForCube * numCubes)
        return false;
    const double numVisits =
        CountRows(space, table.on) + CountRows(space, table.free) + CountRows(space, table.off);
    return numVisits <= kMaxVisits * static_cast<double>(numRows);
}

RowTable ListRows(const Pla& table, bool isInverted, Work& work)
{
    assert(CanListRows(table));
    const CubeSpace& space = table.space;
    const size_t numRows = size_t(1) << space.NumInputs();
    const uint64_t all = ~uint64_t(0) >> (64 - space.NumOutputs());
    RowTable rows;
    rows.numInputs = space.NumInputs();
    rows.numOutputs = space.NumOutputs();
    rows.needed.resize(numRows);
    rows.allowed.resize(numRows);
    std::vector<uint64_t> free(numRows);
    AddRows(space, table.on, rows.needed, work);
    AddRows(space, table.free, free, work);
    const bool areZerosGiven = table.type == PlaType::Fr || table.type == PlaType::Fdr;
    if (areZerosGiven)
        AddRows(space, table.off, rows.allowed, work);
    for (size_t row = 0; row < numRows; ++row) {
        const uint64_t off =
            areZerosGiven ? rows.allowed[row] : all & ~(rows.needed[row] | free[row]);
        const uint64_t on = rows.needed[row] & ~free[row];
        assert((on & off) == 0);
        rows.needed[row] = isInverted ? off : on;
        rows.allowed[row] = all & ~(isInverted ? on : off);
    }
    return rows;
}

RowCube ToRowCube(const CubeSpace& space, const uint64_t* cube)
{
    RowCube rows = {0, 0, 0};
    for (size_t input = 0; input < space.NumInputs(); ++input) {
        const uint32_t bit = uint32_t(1) << input;
        if (!GetBit(cube, 2 * input + 1))
            continue;
        if (GetBit(cube, 2 * input))
            rows.open |= bit;
        else
            rows.values |= bit;
    }
    for (size_t output = 0; output < space.NumOutputs(); ++output)
        rows.outputs |= uint64_t(GetBit(cube, space.OutputBit(output))) << output;
    return rows;
}

void FromRowCube(const CubeSpace& space, const RowCube& rows, uint64_t* cube)
{
    assert((rows.open & rows.values) == 0);
    std::fill(cube, cube + space.NumWords(), 0);
    for (size_t input = 0; input < space.NumInputs(); ++input) {
        if ((rows.values >> input & 1) == 0)
            SetBit(cube, 2 * input);
        if (((rows.values | rows.open) >> input & 1) != 0)
            SetBit(cube, 2 * input + 1);
    }
    for (size_t output = 0; output < space.NumOutputs(); ++output)
        if ((rows.outputs >> output & 1) != 0)
            SetBit(cube, space.OutputBit(output));
}

bool IsSumOfRows(const CubeSpace& space, const RowTable& rows, const CubeList& sum, Work& work)
{
    std::vector<uint64_t> covered(rows.needed.size());
    AddRows(space, sum, covered, work);
    for (size_t row = 0; row < covered.size(); ++row)
        if ((rows.needed[row] & ~covered[row]) != 0 || (covered[row] & ~rows.allowed[row]) != 0)
            return false;
    return true;
}

} // namespace booleq
