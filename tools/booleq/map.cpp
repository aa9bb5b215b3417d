#include "map.h"

#include <algorithm>
#include <cassert>

#include "picture.h"

namespace booleq {

void PutMapText(const Map& map, size_t cellWidth,
                const std::function<MapCell(size_t row, size_t column)>& cellAt, Output& output)
{
    assert(cellWidth >= map.numColumnInputs);
    const std::string rowNames = map.RowNames();
    const size_t width = std::max(rowNames.size(), map.numRowInputs);
    const std::string margin(width - rowNames.size(), ' ');
    output.Put(std::string(width, ' ') + "  " + map.ColumnNames() + "\n");
    const auto putLine = [&](std::string line, const auto& at) {
        size_t numBlanks = 0; // dropped at the end of a line
        for (size_t column = 0; column < map.NumColumns(); ++column) {
            const MapCell cell = at(column);
            line += std::string(numBlanks + 2, ' ') + cell.text;
            assert(cell.width <= cellWidth);
            numBlanks = cellWidth - cell.width;
        }
        output.Put(line + "\n");
    };
    putLine(rowNames + margin, [&](size_t column) {
        return MapCell{map.ColumnLabel(column), map.numColumnInputs};
    });
    for (size_t row = 0; row < map.NumRows(); ++row)
        putLine(map.RowLabel(row) + std::string(width - map.numRowInputs, ' '),
                [&](size_t column) { return cellAt(row, column); });
}

MapPicture::MapPicture(const Map& itsMap, size_t sizeOfCell)
    : map(itsMap), cell(sizeOfCell),
      left(40 + kCharacterWidth * std::max(itsMap.RowNames().size(), itsMap.numRowInputs))
{
}

size_t MapPicture::Right() const
{
    return left + std::max(cell * map.NumColumns(), kCharacterWidth * map.ColumnNames().size());
}

void PutMapBoxes(const MapPicture& picture,
                 const std::function<char(size_t row, size_t column)>& valueAt, Output& output)
{
    const Map& map = picture.map;
    constexpr size_t kLabelLine = MapPicture::kTop - 12;
    output.Put(SvgText(picture.left, 20, "start", map.ColumnNames()));
    output.Put(SvgText(picture.left - 20, kLabelLine, "end", map.RowNames()));
    for (size_t column = 0; column < map.NumColumns(); ++column)
        output.Put(SvgText(picture.X(column) + picture.cell / 2, kLabelLine, "middle",
                           map.ColumnLabel(column)));
    for (size_t row = 0; row < map.NumRows(); ++row) {
        const size_t y = picture.Y(row);
        output.Put(SvgText(picture.left - 20, y + picture.cell / 2 + 5, "end", map.RowLabel(row)));
        for (size_t column = 0; column < map.NumColumns(); ++column) {
            const char value = valueAt(row, column);
            output.Put(SvgBox(picture.X(column), y, picture.cell, picture.cell, value == '1',
                              std::string(1, value)));
        }
    }
}

} // namespace booleq
