// The command 'minimize': the smallest sum of products of a table or of equations, proved before it
// is printed.
#include "minimize.h"

#include <cmath>

#include <unistd.h>

#include "commands.h"
#include "convert.h"
#include "decide.h"
#include "options.h"
#include "progress.h"
#include "text.h"
#include "watch.h"

namespace booleq {

namespace {

const char* const kDefaultTarget = "primary";
constexpr Limits kReadingLimits = {10}; // for reading a written equation back

struct Format {
    bool isPla = false;
    bool isMap = false;
    bool isPicture = false;
    bool isOwn = false;             // lines that this tool reads: a comment may follow
    const Target* target = nullptr; // of equations
};

Format ParseFormat(const Request& request, bool isPlaIn)
{
    Format format;
    const std::string word = request.Get("--to");
    if (!word.empty() && request.json)
        throw UsageError("--json and --to are two formats; give only one");
    format.isPla = word == "pla" || (word.empty() && isPlaIn);
    format.isMap = word == "map";
    format.isPicture = word == "svg";
    if (format.isPla || format.isMap || format.isPicture)
        return format;
    std::string known = "pla, map, svg";
    for (const std::string& name : TargetNames())
        known += name == "pla" ? "" : ", " + name;
    format.target = FindTarget(word.empty() ? kDefaultTarget : word);
    if (!format.target)
        throw UsageError("--to takes one of " + known + ", not '" + Visible(word) + "'");
    format.isOwn = !format.target->notation && format.target->wrapping == Wrapping::Never;
    return format;
}

SumOptions ParseOptions(const Request& request)
{
    SumOptions options;
    options.isExact = request.Has("--exact");
    options.isInverted = request.Has("--products");
    if (request.Has("--terms") && request.Has("--literals"))
        throw UsageError("give only one of --terms and --literals");
    options.goal = request.Has("--literals") ? Goal::Literals : Goal::Terms;
    options.seconds = ParseSeconds(request, 0);
    return options;
}

// "3 terms, 8 literals; proved: no sum has fewer terms, and none with as many has fewer literals"
std::string Verdict(const Sum& sum, Goal goal, bool isInverted)
{
    const std::string first = goal == Goal::Terms ? "terms" : "literals";
    const std::string second = goal == Goal::Terms ? "literals" : "terms";
    const std::string form = isInverted ? "product" : "sum";
    std::string verdict =
        Count(sum.cost.numTerms, "term") + ", " + Count(sum.cost.numLiterals, "literal");
    if (!sum.isProved) {
        verdict += "; not proved";
        if (sum.lowerBound > 1)
            verdict +=
                ": no " + form + " has fewer than " + std::to_string(sum.lowerBound) + " " + first;
        return verdict + (sum.isCutShort ? "; the search was cut short" : "");
    }
    verdict += "; proved: no " + form + " has fewer " + first;
    if (sum.isSecondProved)
        verdict += ", and none with as many has fewer " + second;
    return verdict;
}

Json AsJson(const Pla& table, const Sum& sum, const SumOptions& options)
{
    Json json;
    json["form"] = options.isInverted ? "product of sums" : "sum of products";
    json["inputs"] = table.inputs;
    json["outputs"] = table.outputs;
    json["terms"] = sum.cost.numTerms;
    json["literals"] = sum.cost.numLiterals;
    json["lower_bound"] = sum.lowerBound;
    json["counts"] = options.goal == Goal::Terms ? "terms" : "literals";
    json["proved"] = sum.isProved;
    json["second_proved"] = sum.isSecondProved;
    json["cut_short"] = sum.isCutShort;
    json["cubes"] = Json::array();
    for (size_t index = 0; index < sum.cubes.Size(); ++index)
        json["cubes"].push_back(CubeText(table.space, sum.cubes.At(index)));
    json["equations"] = Json::object();
    for (size_t output = 0; output < table.outputs.size(); ++output) {
        const Expression expression = ExpressionOf(table, sum.cubes, output, options.isInverted);
        const Conversion conversion =
            Convert(expression, *FindTarget(kDefaultTarget), "", kReadingLimits);
        json["equations"][table.outputs[output]] =
            conversion.text.substr(0, conversion.text.find('\n'));
    }
    return json;
}

int PutEquations(const MinimizeInput& input, const Request& request, const Format& format,
                 const Sum& sum, const SumOptions& options, Output& output)
{
    const bool isFile = format.target->wrapping == Wrapping::Always;
    if (isFile && input.table.outputs.size() > 1)
        throw UsageError("--to " + request.Get("--to") + " holds one output, and there are " +
                         std::to_string(input.table.outputs.size()) + "; --to pla holds all");
    int status = kDone;
    for (size_t index = 0; index < input.table.outputs.size(); ++index) {
        const Expression expression =
            ExpressionOf(input.table, sum.cubes, index, options.isInverted);
        const Conversion conversion = Convert(
            expression, *format.target, isFile ? input.table.outputs[index] : "", kReadingLimits);
        if (!conversion.fault.empty()) {
            Refuse(input.text, request, output, conversion.fault);
            return kRefused;
        }
        if (!conversion.saysNames)
            for (const auto& change : ChangedNames(expression.names, conversion.names))
                Complain(output, "note: " + Visible(change.first) + " is written " + change.second);
        if (!conversion.isProved) {
            Complain(output, "warning: not decided whether this reads back as the same function: " +
                                 conversion.doubt);
            status = kUndecided;
        }
        output.Put((isFile ? "" : Visible(input.table.outputs[index]) + " = ") + conversion.text);
    }
    return status;
}

int PutSum(const MinimizeInput& input, const Request& request, const Format& format, const Sum& sum,
           const SumOptions& options, Output& output)
{
    const std::string verdict = Verdict(sum, options.goal, options.isInverted);
    if (request.json) {
        PutJson(input.text, request, "done", AsJson(input.table, sum, options), output);
        return kDone;
    }
    if (format.isPla) {
        output.Put("# " + verdict + "\n" + WritePla(input.table, sum.cubes));
        return kDone;
    }
    if (format.isPicture) {
        PutPictureOfTerms(input.table, sum, output);
        return kDone;
    }
    if (format.isMap) {
        PutMapOfTerms(input.table, sum, isatty(STDOUT_FILENO) == 1, output);
        output.Put("# " + verdict + "\n");
        return kDone;
    }
    const int status = PutEquations(input, request, format, sum, options, output);
    if (status != kRefused && format.isOwn)
        output.Put("# " + verdict + "\n");
    else if (status != kRefused)
        Complain(output, "note: " + verdict);
    return status;
}

void CheckFormat(const Format& format, const SumOptions& options, const Pla& table)
{
    if (options.isInverted && (format.isPla || format.isMap || format.isPicture))
        throw UsageError("--products gives equations; a table or a map shows sums of products");
    if (!format.isMap && !format.isPicture)
        return;
    if (table.inputs.empty() || table.inputs.size() > 6)
        throw UsageError("a map has 1 to 6 inputs, not " + std::to_string(table.inputs.size()));
    if (format.isPicture && table.outputs.size() > 1)
        throw UsageError("a picture shows one output, and there are " +
                         std::to_string(table.outputs.size()) + "; --to map shows all");
}

// Counts the search's calls: that it calls at all shows that it is alive.
Progress* shownProgress = nullptr;
uint64_t numAsked = 0;

void ShowProgress()
{
    if (shownProgress)
        shownProgress->Show(numAsked += 256);
}

int RunMinimize(const Request& request, Output& output)
{
    const SumOptions options = ParseOptions(request);
    ParseFormat(request, false); // a wrong word is reported before any work
    Work work;
    MinimizeInput input;
    Progress progress("minimising, steps", 0);
    shownProgress = &progress;
    SetWatch(ShowProgress);
    struct Unset {
        ~Unset()
        {
            SetWatch(nullptr);
            shownProgress = nullptr;
        }
    } const unset;
    if (!ReadMinimizeInput(request, output, work, input))
        return kRefused;
    const Format format = ParseFormat(request, input.isPla);
    CheckFormat(format, options, input.table);
    Sum sum(input.table.space);
    PlaFault fault;
    if (!Minimise(input.table, options, sum, fault, work)) {
        RefuseFault(input, request, output, fault);
        return kRefused;
    }
    return PutSum(input, request, format, sum, options, output);
}

} // namespace

Command MinimizeCommand()
{
    return {
        "minimize",
        "FILE|EQUATION...",
        1,
        kAnyNumber,
        "Find a small sum of products, with several outputs and don't-cares",
        "A FILE is a PLA file, a truth table of comma-separated values with names in its first\n"
        "line, or lines NAME = EQUATION, where NAME.dc = EQUATION gives the free rows\n"
        "(don't-cares) of NAME. A digit x of an init value (0b1x0x) is a free row. Before an\n"
        "answer is printed it is proved to be 1 wherever the table is 1, and 0 wherever it is 0.\n"
        "A PLA file is answered with a PLA file.\n",
        {{"--dc", "EQUATION", "Free rows of every output: where this is 1"},
         {"--exact", nullptr,
          "Prove that no sum has fewer terms, then that none has fewer literals"},
         {"--seconds", "N", "Stop after N seconds; the answer says what is proved"},
         {"--terms", nullptr, "Count terms first, then literals (the default)"},
         {"--literals", nullptr, "Count literals first, then terms"},
         {"--products", nullptr, "Write a product of sums"},
         {"--outputs", "N", "Outputs of a CSV table: its last N columns (1)"},
         {"--to", "TARGET", "pla, map, svg, or a target of convert (primary)"}},
        {"booleq minimize --dc 'a & b' 'a ^ b' 'a | c'",
         "booleq minimize --inputs a,b 0b1x0x --to map", "booleq minimize --exact table.pla"},
        RunMinimize};
}

} // namespace booleq
