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

// The cells of one output, in the map's order of rows and columns.
struct Cells {
    Cells(const Pla& itsTable, const Sum& sum, size_t itsOutput)
        : table(itsTable), output(itsOutput), map(itsTable.inputs)
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
    const auto cellAt = [&](size_t row, size_t column) {
        MapCell cell = {std::string(1, cells.Value(row, column)), 1};
        for (size_t term = 0; term < cells.terms.size(); ++term) {
            if (!cells.Has(cells.terms[term], row, column))
                continue;
            cell.text += Coloured(Letter(term), term, isColoured);
            cell.width += Letter(term).size();
        }
        return cell;
    };
    PutMapText(map, cellWidth, cellAt, output);
    for (size_t term = 0; term < cells.terms.size(); ++term)
        output.Put("  " + Coloured(Letter(term), term, isColoured) + "  " +
                   TermText(cells.table, cells.terms[term]) + "\n");
}

// The runs of cells that a term has along one side, as [first, last]; a run that wraps around the
// edge becomes two.
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
    const Cells cells(table, sum, 0);
    const Map& map = cells.map;
    const MapPicture picture(map, 56);
    size_t right = picture.Right();
    for (const uint64_t* term : cells.terms)
        right =
            std::max(right, picture.left + kCharacterWidth * (TermText(table, term).size() + 2));
    output.Put(SvgHead(right + 20, picture.Bottom() + 30 + 20 * cells.terms.size()));
    PutMapBoxes(
        picture, [&](size_t row, size_t column) { return cells.Value(row, column); }, output);
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
                output.Put(Frame(
                    picture.X(columnRun.first) + inset, picture.Y(rowRun.first) + inset,
                    picture.X(columnRun.second + 1) - picture.X(columnRun.first) - 2 * inset,
                    picture.Y(rowRun.second + 1) - picture.Y(rowRun.first) - 2 * inset, term));
        const size_t y = picture.Bottom() + 25 + 20 * term;
        output.Put(Frame(picture.left, y - 12, 14, 14, term));
        output.Put(SvgText(picture.left + 24, y, "start", TermText(table, cells.terms[term])));
    }
    output.Put(SvgTail());
}

} // namespace booleq
