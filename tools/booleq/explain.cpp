// The command 'explain': what a function is, and a short expression for it.
#include <kq_logic/explain.h>
#include <kq_logic/short_form.h>

#include "answer.h"
#include "bit_orders.h"
#include "commands.h"
#include "decide.h"
#include "options.h"
#include "table_rows.h"
#include "text.h"

namespace booleq {

namespace {

constexpr size_t kMaxShownInputs = 10; // 1024 binary digits; 'init' writes longer ones

std::string Listed(const std::vector<std::string>& names)
{
    return names.empty() ? "none" : Visible(Join(names, ", "));
}

std::string ShortNote(const kq_logic::ShortForm& shortForm)
{
    const std::string count = Count(shortForm.numOperands, "operand");
    if (shortForm.isMinimal)
        return count + "; no expression of & | ^ ~ and their negated forms has fewer";
    return count + "; shorter ones may exist";
}

void PutText(const kq_logic::Function& function, const kq_logic::Explanation& explanation,
             const kq_logic::ShortForm& shortForm, uint64_t maxRows, Output& output)
{
    const std::vector<std::string>& inputs = function.Inputs();
    std::string order = Listed(inputs);
    if (inputs.size() > 1)
        order += "; " + Visible(inputs.front()) + " is the most significant, row k is bit k";
    PutField(output, "inputs", order);
    if (inputs.empty())
        PutField(output, "init value", "none: there are no rows to number");
    else if (inputs.size() <= kMaxShownInputs)
        PutBitOrders(function, Reversed(function), output);
    PutField(output, "without effect", Listed(explanation.idle));
    PutField(output, "function",
             explanation.kind.empty() ? "no common name" : Visible(explanation.text));
    if (shortForm.fault.empty()) {
        PutField(output, "expression", Visible(shortForm.text));
        PutField(output, "", ShortNote(shortForm));
    } else {
        PutField(output, "expression", "none short enough was found");
    }
    const auto valueAt = [&function](uint64_t row) { return function.At(row); };
    PrintRows(inputs, maxRows, RowFormat::kText, valueAt, output);
}

Json ToJson(const kq_logic::Function& function, const kq_logic::Explanation& explanation,
            const kq_logic::ShortForm& shortForm)
{
    const bool isNamed = !explanation.kind.empty();
    const bool hasExpression = shortForm.fault.empty();
    Json json;
    json["inputs"] = function.Inputs();
    json["hex"] = function.Hex();
    json["binary"] = function.Binary();
    json["lsb_first"] = LsbFirstJson(function);
    json["without_effect"] = explanation.idle;
    json["kind"] = isNamed ? Json(explanation.kind) : Json(nullptr);
    json["function"] = isNamed ? Json(explanation.text) : Json(nullptr);
    json["expression"] = hasExpression ? Json(shortForm.text) : Json(nullptr);
    json["operands"] = hasExpression ? Json(shortForm.numOperands) : Json(nullptr);
    json["minimal"] = shortForm.isMinimal;
    return json;
}

int RunExplain(const Request& request, Output& output)
{
    const uint64_t maxRows = request.Has("--rows") ? ParseRows(request.Get("--rows")) : 64;
    return ForEachText(request, output, [&](const Text& text) {
        kq_logic::Function function;
        if (!SetFunction(text, request, output, function))
            return kRefused;
        const kq_logic::Explanation explanation =
            Watched([&] { return kq_logic::Explain(function); });
        if (!explanation.fault.empty()) {
            Refuse(text, request, output, explanation.fault);
            return kRefused;
        }
        const kq_logic::ShortForm shortForm =
            Watched([&] { return kq_logic::FindShortForm(function); });
        return Say(text, request, output,
                   {kDone, "done", LineMark::Block,
                    [&] { return ToJson(function, explanation, shortForm); },
                    [&] { PutText(function, explanation, shortForm, maxRows, output); }});
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
        "Explain a function: its name, idle inputs, a short expression",
        "Says which inputs have no effect and whether the function has a common name (a gate, a\n"
        "multiplexer, a majority, an and-or-invert form), and writes the shortest expression\n"
        "found. Up to four inputs that is proved to be the shortest; the answer says whether it\n"
        "is. At most 16 inputs.\n",
        {{"--rows", "N|all", "Truth-table rows to print (64)"}},
        {"booleq explain 0xca --inputs S,A,B", "booleq explain 0x07 --inputs A,B,C",
         "booleq explain '(a | b) & (a | c)'"},
        RunExplain};
}

} // namespace booleq
