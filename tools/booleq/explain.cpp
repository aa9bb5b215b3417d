// The command 'explain': what a function is, and a short expression for it.
#include "core/explain.h"

#include "answer.h"
#include "commands.h"
#include "core/minimise.h"
#include "core/text.h"
#include "core/writer.h"
#include "options.h"
#include "rows.h"

namespace booleq {

namespace {

std::string Listed(const std::vector<std::string>& names)
{
    std::string text;
    for (const std::string& name : names)
        text += (text.empty() ? "" : ", ") + Visible(name);
    return text.empty() ? "none" : text;
}

// Written with clear parentheses in the library's first syntax.
std::string ShortText(const Minimised& minimised)
{
    return WriteOwn(minimised.expression, OwnSyntax::First, Parentheses::Clear);
}

std::string ShortNote(const Minimised& minimised)
{
    const std::string count = Count(minimised.numLiterals, "operand");
    if (minimised.isMinimal)
        return count + "; no expression of & | ^ ~ and their negated forms has fewer";
    return count + "; shorter ones may exist";
}

void PutText(const Text& text, const Function& function, const Explanation& explanation,
             const Minimised& minimised, uint64_t maxRows, Output& output)
{
    if (text.line > 0)
        PutField(output, "line", std::to_string(text.line));
    const std::vector<std::string>& inputs = function.Inputs();
    std::string order = Listed(inputs);
    if (inputs.size() > 1)
        order += "; " + Visible(inputs.front()) + " is the most significant, row k is bit k";
    PutField(output, "inputs", order);
    PutField(output, "without effect", Listed(explanation.idle));
    PutField(output, "function",
             explanation.kind.empty() ? "none with a common name" : Visible(explanation.text));
    if (minimised.isFound) {
        PutField(output, "expression", Visible(ShortText(minimised)));
        PutField(output, "", ShortNote(minimised));
    } else {
        PutField(output, "expression", "none of bearable length was found");
    }
    PrintRows(
        inputs, maxRows, RowFormat::kText, [&function](uint64_t row) { return function.At(row); },
        output);
    if (text.line > 0)
        output.Put("\n");
}

Json ToJson(const Function& function, const Explanation& explanation, const Minimised& minimised)
{
    Json json;
    json["inputs"] = function.Inputs();
    json["hex"] = function.Hex();
    json["binary"] = function.Binary();
    json["without_effect"] = explanation.idle;
    json["kind"] = explanation.kind.empty() ? Json(nullptr) : Json(explanation.kind);
    json["function"] = explanation.kind.empty() ? Json(nullptr) : Json(explanation.text);
    json["expression"] = minimised.isFound ? Json(ShortText(minimised)) : Json(nullptr);
    json["operands"] = minimised.isFound ? Json(minimised.numLiterals) : Json(nullptr);
    json["minimal"] = minimised.isFound && minimised.isMinimal;
    return json;
}

int RunExplain(const Request& request, Output& output)
{
    const uint64_t maxRows = request.Has("--rows") ? ParseRows(request.Get("--rows")) : 64;
    return ForEachText(request, output, [&](const Text& text) {
        Function function;
        if (!SetFunction(text, request, output, function))
            return kRefused;
        if (function.NumInputs() > kMaxExplainInputs) {
            Refuse(text, request, output,
                   Count(function.NumInputs(), "input") + ": at most " +
                       std::to_string(kMaxExplainInputs) + " are explained");
            return kRefused;
        }
        const Explanation explanation = Explain(function);
        const Minimised minimised = Minimise(function);
        if (request.json)
            PutJson(text, request, "done", ToJson(function, explanation, minimised), output);
        else
            PutText(text, function, explanation, minimised, maxRows, output);
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
