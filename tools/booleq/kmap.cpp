// The command 'kmap': the Karnaugh map of up to six inputs, as text and as SVG. Rows and columns
// are in Gray code: neighbours differ in one input.
#include "answer.h"
#include "commands.h"
#include "map.h"
#include "picture.h"

namespace booleq {

namespace {

char ValueAt(const kq_logic::Function& function, const Map& map, size_t row, size_t column)
{
    return function.At(map.RowAt(row, column)) ? '1' : '0';
}

void PutText(const kq_logic::Function& function, const Map& map, Output& output)
{
    const std::string blanks(map.numColumnInputs - 1, ' ');
    PutMapText(
        map, map.numColumnInputs,
        [&](size_t row, size_t column) {
            return MapCell{blanks + ValueAt(function, map, row, column), map.numColumnInputs};
        },
        output);
}

void PutSvg(const kq_logic::Function& function, const Map& map, Output& output)
{
    const MapPicture picture(map, 40);
    output.Put(SvgHead(picture.Right() + 20, picture.Bottom() + 20));
    PutMapBoxes(
        picture, [&](size_t row, size_t column) { return ValueAt(function, map, row, column); },
        output);
    output.Put(SvgTail());
}

Json AsJson(const kq_logic::Function& function, const Map& map)
{
    const std::vector<std::string>& names = map.inputs;
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
            cells.push_back(ValueAt(function, map, row, column) == '1' ? 1 : 0);
        result["cells"].push_back(cells);
    }
    return result;
}

int RunMap(const Request& request, Output& output)
{
    RefuseTwoFormats(request, "--svg");
    return ForEachText(request, output, [&](const Text& text) {
        kq_logic::Function function;
        if (!SetFunction(text, request, output, function))
            return kRefused;
        if (!HasPicture(function, "a map", text, request, output))
            return kRefused;
        const Map map(function.Inputs());
        const bool isPicture = request.Has("--svg");
        return Say(
            text, request, output,
            {kDone, "done", isPicture ? LineMark::Nothing : LineMark::Heading,
             [&] { return AsJson(function, map); },
             [&] { isPicture ? PutSvg(function, map, output) : PutText(function, map, output); }});
    });
}

} // namespace

Command KmapCommand()
{
    return {
        "kmap",
        "EQUATION",
        1,
        1,
        "Print the Karnaugh map of up to six inputs",
        "The first half of the inputs numbers the rows, the second half the columns, both in Gray\n"
        "code: neighbours, and the first and the last, differ in one input.\n",
        {{"--svg", nullptr, "Print a picture"}},
        {"booleq kmap 'A & B | ~C & D'", "booleq kmap --svg 'A ^ B ^ C' > map.svg"},
        RunMap};
}

} // namespace booleq
