// The command 'netlist stats': what a design consists of.
#include <algorithm>

#include "census.h"
#include "commands.h"
#include "convert.h"
#include "equation_text.h"
#include "histogram.h"
#include "netlist.h"
#include "text.h"

namespace booleq {

namespace {

std::string Percent(uint64_t part, uint64_t whole)
{
    const uint64_t tenths = whole == 0 ? 0 : (part * 1000 + whole / 2) / whole;
    return std::to_string(tenths / 10) + "." + std::to_string(tenths % 10) + "%";
}

std::string Column(const std::string& text, size_t width)
{
    return std::string(text.size() < width ? width - text.size() : 0, ' ') + text;
}

std::string WidthsText(const std::vector<uint64_t>& widths)
{
    std::vector<std::string> words;
    for (size_t width = 0; width < widths.size(); ++width)
        if (widths[width] > 0)
            words.push_back(std::to_string(width) + ": " + std::to_string(widths[width]));
    return words.empty() ? "none" : Join(words, ", ");
}

void PutTypes(const Census& census, Output& output)
{
    output.Put("\n");
    for (const TypeCount& type : census.types)
        output.Put(Column(std::to_string(type.numCells), 10) + "  " + Visible(type.name) + "  (" +
                   RoleWord(type.role) + (type.note.empty() ? "" : ": " + Visible(type.note)) +
                   ")\n");
}

void PutFunctions(const Census& census, Output& output)
{
    output.Put("\n");
    const size_t numShown = std::min(kMaxCommonest, census.functions.size());
    for (size_t place = 0; place < numShown; ++place) {
        const CountedFunction& function = census.functions[place];
        const NamedFunction named = NameFunction(function.rows);
        output.Put(Column(std::to_string(function.numTables), 10) + "  " +
                   Column(Percent(function.numTables, census.numTables), 6) + "  " +
                   (named.kind.empty() ? named.equation : named.meaning) + "\n");
    }
}

void PutText(const std::string& file, const Design& design, const Census& census, Output& output)
{
    PutField(output, "file",
             Visible(file) + "; " + design.format +
                 (design.top == 0
                      ? std::string()
                      : ", top " + Visible(std::string(design.names.Text(design.top)))));
    PutField(output, "cells", std::to_string(census.numCells));
    PutField(output, "tables", std::to_string(census.numTables));
    PutField(output, "by pins", WidthsText(census.byWidth));
    PutField(output, "by inputs", WidthsText(census.byInputs) + "  (those that matter)");
    PutField(output, "functions", std::to_string(census.functions.size()) + " different");
    PutField(output, "classes",
             std::to_string(census.numClasses) + " up to order and inversions" +
                 (census.numWide == 0 ? ""
                                      : "; not of " + Count(census.numWide, "function") +
                                            " of more than 6 inputs"));
    PutField(output, "constants", std::to_string(census.numConstant));
    PutField(output, "wires", std::to_string(census.numWires));
    PutField(output, "inverters", std::to_string(census.numInverters));
    PutField(output, "idle inputs", "in " + Count(census.numIdle, "table"));
    PutField(output, "not read", Count(census.numUnread, "cell") + " that may hold tables");
    if (census.findings.empty())
        PutField(output, "findings", "none while reading");
    for (const auto& finding : census.findings)
        PutField(output, "findings",
                 std::to_string(finding.second) + " " + CodeWord(finding.first) + ": " +
                     CodeSentence(finding.first));
    PutTypes(census, output);
    PutFunctions(census, output);
}

Json WidthsJson(const std::vector<uint64_t>& widths)
{
    Json json = Json::object();
    for (size_t width = 0; width < widths.size(); ++width)
        if (widths[width] > 0)
            json[std::to_string(width)] = widths[width];
    return json;
}

Json TypesJson(const Census& census)
{
    Json json = Json::array();
    for (const TypeCount& type : census.types)
        json.push_back({{"type", type.name},
                        {"role", RoleWord(type.role)},
                        {"cells", type.numCells},
                        {"note", type.note.empty() ? Json(nullptr) : Json(type.note)}});
    return json;
}

Json FunctionsJson(const Census& census)
{
    Json json = Json::array();
    for (size_t place = 0; place < std::min(kMaxCommonest, census.functions.size()); ++place) {
        const CountedFunction& function = census.functions[place];
        const NamedFunction named = NameFunction(function.rows);
        const Function whole(Letters(function.rows.NumInputs()), function.rows);
        json.push_back(
            {{"tables", function.numTables},
             {"inputs", whole.Inputs()},
             {"hex", whole.Hex()},
             {"kind", named.kind.empty() ? Json(nullptr) : Json(named.kind)},
             {"function", named.meaning.empty() ? Json(nullptr) : Json(named.meaning)},
             {"expression", named.equation.empty() ? Json(nullptr) : Json(named.equation)}});
    }
    return json;
}

Json ToJson(const Design& design, const Census& census)
{
    Json json;
    json["format"] = design.format;
    json["top"] = design.top == 0 ? Json(nullptr) : Json(design.names.Text(design.top));
    json["cells"] = census.numCells;
    json["tables"] = census.numTables;
    json["by_pins"] = WidthsJson(census.byWidth);
    json["by_inputs"] = WidthsJson(census.byInputs);
    json["functions"] = census.functions.size();
    json["classes"] = census.numClasses;
    json["wide_functions"] = census.numWide;
    json["constants"] = census.numConstant;
    json["wires"] = census.numWires;
    json["inverters"] = census.numInverters;
    json["idle_inputs"] = census.numIdle;
    json["not_read"] = census.numUnread;
    json["findings"] = Json::object();
    for (const auto& finding : census.findings)
        json["findings"][CodeWord(finding.first)] = finding.second;
    json["types"] = TypesJson(census);
    json["commonest"] = FunctionsJson(census);
    return json;
}

std::vector<Bar> FunctionBars(const Census& census)
{
    std::vector<Bar> bars;
    for (size_t place = 0; place < std::min(kMaxCommonest, census.functions.size()); ++place) {
        const CountedFunction& function = census.functions[place];
        const NamedFunction named = NameFunction(function.rows);
        bars.push_back({named.kind.empty() ? named.equation : named.meaning, function.numTables});
    }
    return bars;
}

std::vector<Bar> WidthBars(const Census& census)
{
    std::vector<Bar> bars;
    for (size_t width = 0; width < census.byInputs.size(); ++width)
        bars.push_back({Count(width, "input"), census.byInputs[width]});
    return bars;
}

int RunStats(const Request& request, Output& output)
{
    RefuseTwoFormats(request, "--svg");
    const CellTypes cellTypes = CellTypesOf(request);
    if (request.Has("--svg") && request.operands.size() > 1)
        throw UsageError("--svg makes one picture: give one file");
    CheckFiles(request); // before any answer
    int status = kDone;
    for (const std::string& file : request.operands) {
        Design design;
        if (!ReadNetlist(file, request, cellTypes, "", output, design)) {
            status = kRefused;
            continue;
        }
        const Census census = TakeCensus(design);
        if (request.Has("--svg"))
            PutHistograms({{"Tables by inputs that matter", WidthBars(census)},
                           {"Commonest functions", FunctionBars(census)}},
                          output);
        else if (request.json)
            PutJson({file, 0}, request, "done", ToJson(design, census), output);
        else {
            if (file != request.operands.front())
                output.Put("\n");
            PutText(file, design, census, output);
        }
    }
    return status;
}

} // namespace

Command NetlistStatsCommand()
{
    std::vector<Option> options = {
        {"--svg", nullptr, "Print a picture: tables by width and by function"}};
    for (const Option& option : NetlistOptions())
        options.push_back(option);
    return {
        "netlist stats",
        "FILE...",
        1,
        kAnyNumber,
        "Count the look-up tables of a netlist, their functions and oddities",
        "A FILE is Yosys JSON, BLIF, EDIF 2.0.0 or structural Verilog, plain or gzip-compressed;\n"
        "- is standard input. Verilog is read by the program yosys. Functions are counted after\n"
        "constant and repeated inputs are folded and idle ones left out; functions of one class\n"
        "are the same up to the order of inputs and inversions. Cells that are more than a\n"
        "look-up table, such as shift registers, are counted but not read.\n",
        options,
        {"booleq netlist stats design.json", "booleq netlist stats --svg design.blif"},
        RunStats,
        true};
}

} // namespace booleq
