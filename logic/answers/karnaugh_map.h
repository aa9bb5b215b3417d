// How a Karnaugh map arranges the rows of a function: its rows and columns are in Gray code, so
// neighbours differ in one input.
#ifndef BOOLEQ_ANSWERS_KARNAUGH_MAP_H
#define BOOLEQ_ANSWERS_KARNAUGH_MAP_H

#include <cstddef>
#include <cstdint>
#include <string>
#include <vector>

#include "text.h"

namespace booleq {

inline size_t GrayCode(size_t place)
{
    return place ^ (place >> 1);
}

inline std::string GrayBits(size_t value, size_t width)
{
    std::string bits;
    for (size_t bit = width; bit-- > 0;)
        bits += (value >> bit & 1u) ? '1' : '0';
    return bits;
}

// The first half of the inputs, rounded down, numbers the map's rows; the others number its
// columns.
struct Map {
    explicit Map(const std::vector<std::string>& names)
        : inputs(names), numRowInputs(names.size() / 2),
          numColumnInputs(names.size() - numRowInputs)
    {
    }

    size_t NumRows() const { return size_t(1) << numRowInputs; }
    size_t NumColumns() const { return size_t(1) << numColumnInputs; }
    std::string RowLabel(size_t row) const { return GrayBits(GrayCode(row), numRowInputs); }
    std::string ColumnLabel(size_t column) const
    {
        return GrayBits(GrayCode(column), numColumnInputs);
    }
    uint64_t RowAt(size_t row, size_t column) const
    {
        return GrayCode(row) << numColumnInputs | GrayCode(column);
    }
    std::string RowNames() const { return Names(0, numRowInputs); }
    std::string ColumnNames() const { return Names(numRowInputs, inputs.size()); }
    std::string Names(size_t from, size_t to) const
    {
        const auto begin = inputs.begin();
        return Visible(Join({begin + static_cast<long>(from), begin + static_cast<long>(to)}, " "));
    }

    std::vector<std::string> inputs;
    size_t numRowInputs;
    size_t numColumnInputs;
};

} // namespace booleq

#endif
