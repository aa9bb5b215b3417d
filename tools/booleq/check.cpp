// The command 'check': accepted, or the refusal that every command gives.
#include "answer.h"
#include "commands.h"
#include "function.h"
#include "table_rows.h"
#include "text.h"

namespace booleq {

namespace {

std::string Kind(const Kq_BoolEquation& equation)
{
    if (equation.IsHexInitValue())
        return "hexadecimal init value";
    return equation.IsBinaryInitValue() ? "binary init value" : "expression";
}

int RunCheck(const Request& request, Output& output)
{
    return ForEachText(request, output, [&](const Text& text) {
        Kq_BoolEquation equation;
        if (!SetEquation(text, request, output, equation))
            return kRefused;
        const std::vector<std::string> names = InputNames(equation);
        const auto toJson = [&] { return Json{{"kind", Kind(equation)}, {"inputs", names}}; };
        const auto putText = [&] {
            const std::string list = names.empty() ? "" : ": " + Visible(Join(names, ", "));
            output.Put("accepted: " + Kind(equation) + " over " +
                       (names.empty() ? "no inputs" : Count(names.size(), "input")) + list + "\n");
        };
        return Say(text, request, output, {kDone, "yes", LineMark::Prefix, toJson, putText});
    });
}

} // namespace

Command CheckCommand()
{
    return {
        "check",
        "EQUATION",
        1,
        1,
        "Tell whether a text is accepted; if not, where and why",
        "Every command refuses a text in the same way: it marks the place, gives the reason and,\n"
        "if the text shows what was meant, a hint. Status 0: accepted, 3: refused.\n",
        {},
        {"booleq check 'A && B'", "booleq check \"A'\"", "booleq check --file equations.txt"},
        RunCheck};
}

} // namespace booleq
