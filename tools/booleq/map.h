// How a Karnaugh map lays out the rows of a function, as text and as a picture: rows and columns
// stand in Gray code, so neighbours differ in one input. What stands in a cell is the caller's.
#ifndef BOOLEQ_MAP_H
#define BOOLEQ_MAP_H

#include <cstddef>
#include <cstdint>
#include <functional>
#include <string>
#include <vector>

#include "output.h"
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

// The first half of the inputs, rounded down, numbers the rows, the others the columns.
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

// What stands in a cell of text, and how many columns of a terminal it takes.
struct MapCell {
    std::string text;
    size_t width;
};
// Cells stand 'cellWidth' apart, as wide as a column's label at least.
void PutMapText(const Map& map, size_t cellWidth,
                const std::function<MapCell(size_t row, size_t column)>& cellAt, Output& output);

// Where the cells of a picture are; all lengths are pixels.
struct MapPicture {
    MapPicture(const Map& itsMap, size_t sizeOfCell);

    size_t X(size_t column) const { return left + cell * column; }
    size_t Y(size_t row) const { return kTop + cell * row; }
    size_t Right() const; // of cells and names
    size_t Bottom() const { return Y(map.NumRows()); }

    static constexpr size_t kTop = 60;
    const Map& map;
    size_t cell;
    size_t left;
};
// Names, labels and boxes; valueAt gives '0', '1' or '-'.
void PutMapBoxes(const MapPicture& picture,
                 const std::function<char(size_t row, size_t column)>& valueAt, Output& output);

} // namespace booleq

#endif
