// The command 'sat': can an equation be 1, or is it always.
#include <algorithm>

#include "commands.h"
#include "decide.h"
#include "equality.h"
#include "text.h"

namespace booleq {

namespace {

// The question: is there an assignment for which the equation has the value that is looked for.
// Different answers yes, Equal no.
bool IsYes(const Decision& decision, bool asksAlways)
{
    return asksAlways ? decision.IsEqual() : decision.IsDifferent();
}

int StatusOf(const Decision& decision, bool asksAlways)
{
    if (decision.verdict == Verdict::Undecided)
        return kUndecided;
    return IsYes(decision, asksAlways) ? kDone : kFindings;
}

void PutText(const Decision& decision, bool asksAlways, const Limits& limits, Output& output)
{
    if (decision.IsEqual())
        output.Put((asksAlways ? "always 1, over " : "never 1, over ") +
                   Count(decision.inputs.size(), "input") + "\n");
    else if (decision.IsDifferent())
        output.Put((asksAlways ? "not always 1, 0 " : "satisfiable, 1 ") + PlaceText(decision) +
                   "\n  " + AssignmentLine(decision) + "\n");
    else
        output.Put(UndecidedText(decision, limits) + "\n");
}

Json AsJson(const Decision& decision, bool asksAlways)
{
    Json result;
    const bool isDecided = decision.verdict != Verdict::Undecided;
    result[asksAlways ? "always" : "satisfiable"] =
        isDecided ? Json(IsYes(decision, asksAlways)) : Json();
    result["inputs"] = decision.inputs;
    result["row"] = decision.IsDifferent() ? RowJson(decision) : Json();
    result["is_first"] = decision.IsDifferent() ? Json(decision.isFirstRow) : Json();
    result["assignment"] = decision.IsDifferent() ? AssignmentJson(decision) : Json();
    if (!isDecided)
        result["reason"] = decision.reason;
    return result;
}

int RunSat(const Request& request, Output& output)
{
    CheckClauseOptions(request);
    const Limits limits = ParseLimits(request, 0);
    const bool asksAlways = request.Has("--always");
    return ForEachText(request, output, [&](const Text& text) {
        Kq_BoolEquation equation;
        if (!SetEquation(text, request, output, equation))
            return kRefused;
        const Kq_BoolEquation constant(asksAlways ? "1" : "0");
        Decision decision;
        int status = kDone;
        {
            const DecidingProgress progress;
            decision = DecideEquations(equation, constant, limits);
            if (WantsClauses(request))
                status = WriteClauses(request, output,
                                      ClausesOfValue(ToExpression(equation), !asksAlways),
                                      decision.verdict, limits);
        }
        const int answer = StatusOf(decision, asksAlways);
        const char* const word =
            answer == kUndecided ? "undecided" : (answer == kDone ? "yes" : "no");
        return Say(text, request, output,
                   {std::max(status, answer), word, LineMark::Prefix,
                    [&] { return AsJson(decision, asksAlways); },
                    [&] { PutText(decision, asksAlways, limits, output); }});
    });
}

std::vector<Option> Options()
{
    std::vector<Option> options = {
        {"--always", nullptr, "Ask whether it is 1 for every assignment, a tautology"},
        SecondsOption()};
    for (const Option& option : ClauseOptions())
        options.push_back(option);
    return options;
}

} // namespace

Command SatCommand()
{
    return {
        "sat",
        "EQUATION",
        1,
        1,
        "Find an assignment for which an equation is 1, or tell that none is",
        "Up to 30 inputs the first such assignment is printed, above that one of them. With\n"
        "--always the question is whether the equation is 1 for all of them, and an assignment "
        "for\n"
        "which it is 0 is looked for. Status 0: yes, 1: no, 4: not decided, when --seconds came\n"
        "first. The clauses of --cnf are satisfied by the assignments that are looked for.\n",
        Options(),
        {"booleq sat '(A | B) & ~A'", "booleq sat 'A & ~A'", "booleq sat --always 'A | ~A'",
         "booleq sat --cnf a.cnf --proof a.drat 'A & (B ^ A) & B'"},
        RunSat};
}

} // namespace booleq
