// The command 'explain': what a function is, and a short expression for it.
#include "describe.h"

#include "answer.h"
#include "commands.h"
#include "options.h"
#include "rows.h"
#include "text.h"

namespace booleq {

namespace {

std::string Listed(const std::vector<std::string>& names)
{
    std::string text;
    for (const std::string& name : names)
        text += (text.empty() ? "" : ", ") + Visible(name);
    return text.empty() ? "none" : text;
}

std::string ShortNote(const Description& description)
{
    const std::string count = Count(description.numOperands, "operand");
    if (description.isMinimal)
        return count + "; no expression of & | ^ ~ and their negated forms has fewer";
    return count + "; shorter ones may exist";
}

void PutText(const Text& text, const Function& function, const Description& description,
             uint64_t maxRows, Output& output)
{
    if (text.line > 0)
        PutField(output, "line", std::to_string(text.line));
    const std::vector<std::string>& inputs = function.Inputs();
    std::string order = Listed(inputs);
    if (inputs.size() > 1)
        order += "; " + Visible(inputs.front()) + " is the most significant, row k is bit k";
    PutField(output, "inputs", order);
    PutField(output, "without effect", Listed(description.idle));
    PutField(output, "function",
             description.kind.empty() ? "none with a common name" : Visible(description.text));
    if (!description.expression.empty()) {
        PutField(output, "expression", Visible(description.expression));
        PutField(output, "", ShortNote(description));
    } else {
        PutField(output, "expression", "none of bearable length was found");
    }
    PrintRows(
        inputs, maxRows, RowFormat::kText, [&function](uint64_t row) { return function.At(row); },
        output);
    if (text.line > 0)
        output.Put("\n");
}

Json ToJson(const Function& function, const Description& description)
{
    const bool isNamed = !description.kind.empty();
    const bool hasExpression = !description.expression.empty();
    Json json;
    json["inputs"] = function.Inputs();
    json["hex"] = function.Hex();
    json["binary"] = function.Binary();
    json["without_effect"] = description.idle;
    json["kind"] = isNamed ? Json(description.kind) : Json(nullptr);
    json["function"] = isNamed ? Json(description.text) : Json(nullptr);
    json["expression"] = hasExpression ? Json(description.expression) : Json(nullptr);
    json["operands"] = hasExpression ? Json(description.numOperands) : Json(nullptr);
    json["minimal"] = description.isMinimal;
    return json;
}

int RunExplain(const Request& request, Output& output)
{
    const uint64_t maxRows = request.Has("--rows") ? ParseRows(request.Get("--rows")) : 64;
    return ForEachText(request, output, [&](const Text& text) {
        Function function;
        if (!SetFunction(text, request, output, function))
            return kRefused;
        const Description description = Describe(function);
        if (!description.fault.empty()) {
            Refuse(text, request, output, description.fault);
            return kRefused;
        }
        if (request.json)
            PutJson(text, request, "done", ToJson(function, description), output);
        else
            PutText(text, function, description, maxRows, output);
        return kDone;
    });
}

} // namespace

Command ExplainCommand()
{
    return {
        "explain",
        "INIT|EQUATION",
        1,
        1,
        "Say what a function is: its name, idle inputs, a short expression",
        "Says which inputs have no effect, whether it is a gate, a multiplexer, a majority, an\n"
        "and-or-invert form or the like, and writes the shortest expression that was found; the\n"
        "answer says whether it is proved that none is shorter, which it is up to four inputs.\n"
        "At most 16 inputs.\n",
        {{"--rows", "N|all", "Truth-table rows to print (64)"}},
        {"booleq explain 0xca --inputs S,A,B", "booleq explain 0x07 --inputs A,B,C",
         "booleq explain '(a | b) & (a | c)'"},
        RunExplain};
}

} // namespace booleq
