// A Karnaugh map (karnaugh_map.h) as text and as a picture. The caller decides what is in a cell.
#ifndef BOOLEQ_MAP_H
#define BOOLEQ_MAP_H

#include <cstddef>
#include <functional>
#include <string>

#include "karnaugh_map.h"
#include "output.h"

namespace booleq {

// The contents of a cell as text, and how many columns of a terminal they take.
struct MapCell {
    std::string text;
    size_t width;
};
// Cells are 'cellWidth' apart.  Requires: a width of at least that of a column's label.
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
