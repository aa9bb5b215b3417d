// The command 'table': the truth table in several formats, streamed.
#include <algorithm>
#include <limits>

#include "answer.h"
#include "commands.h"
#include "options.h"
#include "table_rows.h"
#include "text.h"

namespace booleq {

namespace {

RowFormat ParseFormat(const Request& request)
{
    const std::string format = request.Get("--format");
    if (request.json && format != "json" && request.Has("--format"))
        throw UsageError("--json and --format " + Visible(format) +
                         " are two formats; give only one");
    if (format == "markdown")
        return RowFormat::kMarkdown;
    if (format == "csv")
        return RowFormat::kCsv;
    if (format == "json" || request.json)
        return RowFormat::kJson;
    if (format == "text" || !request.Has("--format"))
        return RowFormat::kText;
    throw UsageError("--format is text, markdown, csv or json, not '" + Visible(format) + "'");
}

// Announces a large table, so that nobody fills a disk by accident.
void AnnounceSize(const std::vector<std::string>& names, uint64_t maxRows, RowFormat format,
                  Output& output)
{
    constexpr uint64_t kMuch = 10000000;
    const uint64_t numBytes = EstimateBytes(names, maxRows, format);
    if (numBytes < kMuch)
        return;
    const uint64_t numRows = std::min(maxRows, uint64_t(1) << names.size());
    Complain(output, std::to_string(numRows) + " rows, about " +
                         std::to_string(numBytes / 1000000) + " MB");
}

void PutRows(const Text& text, const Request& request, const kq_logic::Function& function,
             RowFormat format, Output& output)
{
    const std::vector<std::string>& names = function.Inputs();
    const uint64_t maxRows = request.Has("--rows") ? ParseRows(request.Get("--rows"))
                                                   : std::numeric_limits<uint64_t>::max();
    AnnounceSize(names, maxRows, format, output);
    const auto valueAt = [&function](uint64_t row) { return function.At(row); };
    if (format != RowFormat::kJson) {
        PrintRows(names, maxRows, format, valueAt, output);
        return;
    }
    Json result;
    result["inputs"] = names;
    result["num_rows"] = function.NumRows();
    result["rows"] = Json::array();
    const auto around = JsonAroundArray(text, request, "done", result);
    output.Put(around.first);
    PrintRows(names, maxRows, format, valueAt, output);
    output.Put(around.second);
}

int RunTable(const Request& request, Output& output)
{
    const RowFormat format = ParseFormat(request);
    if (request.Has("--rows"))
        ParseRows(request.Get("--rows")); // wrong usage is reported before any answer
    Request asJson = request;             // refusals use the same format
    asJson.json = format == RowFormat::kJson;
    return ForEachText(asJson, output, [&](const Text& text) {
        kq_logic::Function function;
        if (!SetFunction(text, asJson, output, function))
            return kRefused;
        if (text.line > 0 && format != RowFormat::kJson)
            output.Put("# line " + std::to_string(text.line) + "\n");
        PutRows(text, asJson, function, format, output);
        return kDone;
    });
}

} // namespace

Command TableCommand()
{
    return {
        "table",
        "EQUATION",
        1,
        1,
        "Print the truth table as text, Markdown, CSV or JSON",
        "Row k assigns the binary digits of k to the inputs, the first input most significant. Up\n"
        "to 30 inputs. Rows are written as they are computed; a table of more than 10 MB is\n"
        "announced with its size first. When several lines are read, each table begins with '#\n"
        "line N'.\n",
        {{"--format", "text|markdown|csv|json", "How to print it (text)"},
         {"--rows", "N|all", "Rows to print (all)"}},
        {"booleq table 'A & ~B'", "booleq table --format csv 'A ^ B ^ C'",
         "booleq table --inputs A,B 0x6 --format markdown"},
        RunTable};
}

} // namespace booleq
