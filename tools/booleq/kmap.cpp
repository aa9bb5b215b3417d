// The command 'kmap': the Karnaugh map of up to six inputs, as text and as SVG. Rows and columns
// stand in Gray code: neighbours differ in one input.
#include <algorithm>

#include "answer.h"
#include "commands.h"
#include "map.h"
#include "picture.h"

namespace booleq {

namespace {

void PutText(const Map& map, Output& output)
{
    const std::string rowNames = map.RowNames();
    const size_t width = std::max(rowNames.size(), map.numRowInputs);
    output.Put(std::string(width, ' ') + "  " + map.ColumnNames() + "\n");
    output.Put(rowNames + std::string(width - rowNames.size(), ' '));
    for (size_t column = 0; column < map.NumColumns(); ++column)
        output.Put("  " + map.ColumnLabel(column));
    output.Put("\n");
    for (size_t row = 0; row < map.NumRows(); ++row) {
        const std::string label = map.RowLabel(row);
        output.Put(label + std::string(width - label.size(), ' '));
        for (size_t column = 0; column < map.NumColumns(); ++column)
            output.Put("  " + std::string(map.numColumnInputs - 1, ' ') +
                       (map.At(row, column) ? "1" : "0"));
        output.Put("\n");
    }
}

void PutSvg(const Map& map, Output& output)
{
    constexpr size_t kCell = 40;
    constexpr size_t kTop = 60;
    const size_t left = 40 + kCharacterWidth * std::max(map.RowNames().size(), map.numRowInputs);
    const size_t width =
        left + std::max(kCell * map.NumColumns(), kCharacterWidth * map.ColumnNames().size()) + 20;
    const size_t height = kTop + kCell * map.NumRows() + 20;
    output.Put(SvgHead(width, height));
    output.Put(SvgText(left, 20, "start", map.ColumnNames()));
    output.Put(SvgText(left - 20, kTop - 12, "end", map.RowNames()));
    for (size_t column = 0; column < map.NumColumns(); ++column)
        output.Put(SvgText(left + kCell * column + kCell / 2, kTop - 12, "middle",
                           map.ColumnLabel(column)));
    for (size_t row = 0; row < map.NumRows(); ++row) {
        const size_t y = kTop + kCell * row;
        output.Put(SvgText(left - 20, y + kCell / 2 + 5, "end", map.RowLabel(row)));
        for (size_t column = 0; column < map.NumColumns(); ++column) {
            const size_t x = left + kCell * column;
            const bool value = map.At(row, column);
            output.Put(SvgBox(x, y, kCell, kCell, value, value ? "1" : "0"));
        }
    }
    output.Put(SvgTail());
}

Json AsJson(const Map& map)
{
    const std::vector<std::string>& names = map.function.Inputs();
    const auto middle = names.begin() + static_cast<std::ptrdiff_t>(map.numRowInputs);
    Json result;
    result["row_inputs"] = std::vector<std::string>(names.begin(), middle);
    result["column_inputs"] = std::vector<std::string>(middle, names.end());
    result["row_labels"] = Json::array();
    result["column_labels"] = Json::array();
    result["cells"] = Json::array();
    for (size_t column = 0; column < map.NumColumns(); ++column)
        result["column_labels"].push_back(map.ColumnLabel(column));
    for (size_t row = 0; row < map.NumRows(); ++row) {
        result["row_labels"].push_back(map.RowLabel(row));
        Json cells = Json::array();
        for (size_t column = 0; column < map.NumColumns(); ++column)
            cells.push_back(map.At(row, column) ? 1 : 0);
        result["cells"].push_back(cells);
    }
    return result;
}

int RunMap(const Request& request, Output& output)
{
    RefuseTwoFormats(request, "--svg");
    return ForEachText(request, output, [&](const Text& text) {
        Function function;
        if (!SetFunction(text, request, output, function))
            return kRefused;
        if (!HasPicture(function, "a map", text, request, output))
            return kRefused;
        const Map map(function);
        const bool isPicture = request.Has("--svg");
        return Say(text, request, output,
                   {kDone, "done", isPicture ? LineMark::Nothing : LineMark::Heading,
                    [&] { return AsJson(map); },
                    [&] { isPicture ? PutSvg(map, output) : PutText(map, output); }});
    });
}

} // namespace

Command KmapCommand()
{
    return {"kmap",
            "EQUATION",
            1,
            1,
            "Print the Karnaugh map of up to six inputs",
            "The first half of the inputs numbers the rows, the others the columns, both in Gray\n"
            "code: neighbours differ in one input, the first and the last one too.\n",
            {{"--svg", nullptr, "Print a picture"}},
            {"booleq kmap 'A & B | ~C & D'", "booleq kmap --svg 'A ^ B ^ C' > map.svg"},
            RunMap};
}

} // namespace booleq
