// Karnaugh maps with their terms: letters in the text, frames in the picture.
#include <algorithm>

#include "map.h"
#include "minimize.h"
#include "picture.h"

namespace booleq {

namespace {

const char* const kColours[] = {"#1f6fb2", "#c0392b", "#2e8b57", "#8e44ad", "#d35400", "#2c3e50"};
constexpr size_t kNumColours = 6;
constexpr int kAnsiColours[kNumColours] = {34, 31, 32, 35, 33, 36};

// The cells of one output: in the map's row and column order.
struct Cells {
    Cells(const Pla& itsTable, const Sum& sum, size_t itsOutput)
        : table(itsTable), output(itsOutput),
          function(table.inputs, Rows(static_cast<unsigned int>(itsTable.inputs.size()))),
          map(function)
    {
        for (size_t index = 0; index < sum.cubes.Size(); ++index)
            if (GetBit(sum.cubes.At(index), table.space.OutputBit(output)))
                terms.push_back(sum.cubes.At(index));
    }

    // Whether a cube has the row of the map's cell.
    bool Has(const uint64_t* cube, size_t row, size_t column) const
    {
        const uint64_t assignment = map.RowAt(row, column);
        const size_t numInputs = table.inputs.size();
        for (size_t input = 0; input < numInputs; ++input)
            if (!GetBit(cube, 2 * input + (assignment >> (numInputs - 1 - input) & 1)))
                return false;
        return true;
    }

    // '-' for a free row, otherwise the value of the sum.
    char Value(size_t row, size_t column) const
    {
        for (size_t index = 0; index < table.free.Size(); ++index)
            if (GetBit(table.free.At(index), table.space.OutputBit(output)) &&
                Has(table.free.At(index), row, column))
                return '-';
        return std::any_of(terms.begin(), terms.end(),
                           [&](const uint64_t* term) { return Has(term, row, column); })
                   ? '1'
                   : '0';
    }

    const Pla& table;
    size_t output;
    Function function; // the inputs' names, for the map
    Map map;
    std::vector<const uint64_t*> terms;
};

std::string Letter(size_t term)
{
    return term < 26 ? std::string(1, static_cast<char>('a' + term))
                     : "(" + std::to_string(term + 1) + ")";
}

std::string TermText(const Pla& table, const uint64_t* cube)
{
    std::string text;
    for (size_t input = 0; input < table.inputs.size(); ++input) {
        const bool hasZero = GetBit(cube, 2 * input);
        const bool hasOne = GetBit(cube, 2 * input + 1);
        if (!hasZero || !hasOne)
            text += (text.empty() ? "" : " & ") + std::string(hasZero ? "~" : "") +
                    Visible(table.inputs[input]);
    }
    return text.empty() ? "1" : text;
}

std::string Coloured(const std::string& text, size_t term, bool isColoured)
{
    if (!isColoured)
        return text;
    return "\x1b[" + std::to_string(kAnsiColours[term % kNumColours]) + "m" + text + "\x1b[0m";
}

void PutTextMap(const Cells& cells, bool isColoured, Output& output)
{
    const Map& map = cells.map;
    size_t cellWidth = map.numColumnInputs;
    for (size_t row = 0; row < map.NumRows(); ++row)
        for (size_t column = 0; column < map.NumColumns(); ++column) {
            size_t width = 1;
            for (size_t term = 0; term < cells.terms.size(); ++term)
                width += cells.Has(cells.terms[term], row, column) ? Letter(term).size() : 0;
            cellWidth = std::max(cellWidth, width);
        }
    const size_t width = std::max(map.RowNames().size(), map.numRowInputs);
    output.Put(std::string(width, ' ') + "  " + map.ColumnNames() + "\n");
    output.Put(map.RowNames() + std::string(width - map.RowNames().size(), ' '));
    for (size_t column = 0; column < map.NumColumns(); ++column)
        output.Put("  " + map.ColumnLabel(column) +
                   (column + 1 < map.NumColumns()
                        ? std::string(cellWidth - map.numColumnInputs, ' ')
                        : std::string()));
    output.Put("\n");
    for (size_t row = 0; row < map.NumRows(); ++row) {
        std::string line = map.RowLabel(row) + std::string(width - map.RowLabel(row).size(), ' ');
        size_t numBlanks = 0; // not written at the end of a line
        for (size_t column = 0; column < map.NumColumns(); ++column) {
            line += std::string(numBlanks + 2, ' ') + cells.Value(row, column);
            size_t used = 1;
            for (size_t term = 0; term < cells.terms.size(); ++term) {
                if (!cells.Has(cells.terms[term], row, column))
                    continue;
                line += Coloured(Letter(term), term, isColoured);
                used += Letter(term).size();
            }
            numBlanks = cellWidth - used;
        }
        output.Put(line + "\n");
    }
    for (size_t term = 0; term < cells.terms.size(); ++term)
        output.Put("  " + Coloured(Letter(term), term, isColoured) + "  " +
                   TermText(cells.table, cells.terms[term]) + "\n");
}

// Runs of places that a term has along one side, as [first, last]; one that goes over the edge is
// two.
std::vector<std::pair<size_t, size_t>> Runs(size_t numPlaces, const std::vector<bool>& isIn)
{
    std::vector<std::pair<size_t, size_t>> runs;
    for (size_t place = 0; place < numPlaces; ++place) {
        if (!isIn[place])
            continue;
        if (!runs.empty() && runs.back().second + 1 == place)
            runs.back().second = place;
        else
            runs.push_back({place, place});
    }
    return runs;
}

std::string Frame(size_t x, size_t y, size_t width, size_t height, size_t term)
{
    return "<rect x=\"" + std::to_string(x) + "\" y=\"" + std::to_string(y) + "\" width=\"" +
           std::to_string(width) + "\" height=\"" + std::to_string(height) +
           "\" rx=\"8\" fill=\"none\" stroke-width=\"2\" stroke=\"" + kColours[term % kNumColours] +
           "\"/>\n";
}

} // namespace

void PutMapOfTerms(const Pla& table, const Sum& sum, bool isColoured, Output& output)
{
    for (size_t index = 0; index < table.outputs.size(); ++index) {
        output.Put((index == 0 ? "" : "\n") + Visible(table.outputs[index]) + "\n");
        PutTextMap(Cells(table, sum, index), isColoured, output);
    }
}

void PutPictureOfTerms(const Pla& table, const Sum& sum, Output& output)
{
    constexpr size_t kCell = 56;
    constexpr size_t kTop = 60;
    const Cells cells(table, sum, 0);
    const Map& map = cells.map;
    const size_t left = 40 + kCharacterWidth * std::max(map.RowNames().size(), map.numRowInputs);
    size_t widest = std::max(kCell * map.NumColumns(), kCharacterWidth * map.ColumnNames().size());
    for (const uint64_t* term : cells.terms)
        widest = std::max(widest, kCharacterWidth * (TermText(table, term).size() + 2));
    const size_t bottom = kTop + kCell * map.NumRows();
    output.Put(SvgHead(left + widest + 20, bottom + 30 + 20 * cells.terms.size()));
    output.Put(SvgText(left, 20, "start", map.ColumnNames()));
    output.Put(SvgText(left - 20, kTop - 12, "end", map.RowNames()));
    for (size_t column = 0; column < map.NumColumns(); ++column)
        output.Put(SvgText(left + kCell * column + kCell / 2, kTop - 12, "middle",
                           map.ColumnLabel(column)));
    for (size_t row = 0; row < map.NumRows(); ++row) {
        const size_t y = kTop + kCell * row;
        output.Put(SvgText(left - 20, y + kCell / 2 + 5, "end", map.RowLabel(row)));
        for (size_t column = 0; column < map.NumColumns(); ++column) {
            const char value = cells.Value(row, column);
            output.Put(SvgBox(left + kCell * column, y, kCell, kCell, value == '1',
                              std::string(1, value)));
        }
    }
    for (size_t term = 0; term < cells.terms.size(); ++term) {
        std::vector<bool> rows(map.NumRows());
        std::vector<bool> columns(map.NumColumns());
        for (size_t row = 0; row < rows.size(); ++row)
            for (size_t column = 0; column < columns.size(); ++column)
                if (cells.Has(cells.terms[term], row, column))
                    rows[row] = columns[column] = true;
        const size_t inset = 3 + 3 * (term % 6);
        for (const auto& rowRun : Runs(rows.size(), rows))
            for (const auto& columnRun : Runs(columns.size(), columns))
                output.Put(Frame(left + kCell * columnRun.first + inset,
                                 kTop + kCell * rowRun.first + inset,
                                 kCell * (columnRun.second - columnRun.first + 1) - 2 * inset,
                                 kCell * (rowRun.second - rowRun.first + 1) - 2 * inset, term));
        const size_t y = bottom + 25 + 20 * term;
        output.Put(Frame(left, y - 12, 14, 14, term));
        output.Put(SvgText(left + 24, y, "start", TermText(table, cells.terms[term])));
    }
    output.Put(SvgTail());
}

} // namespace booleq
