// The command 'sat': whether an equation can be 1, or is always 1.
#include <algorithm>

#include "commands.h"
#include "decide.h"
#include "text.h"

namespace booleq {

namespace {

// The question: whether the equation has the value looked for under some assignment.
// Different answers yes, Equal no.
bool IsYes(const kq_logic::Decision& decision, bool asksAlways)
{
    return asksAlways ? IsEqual(decision) : IsDifferent(decision);
}

int StatusOf(const kq_logic::Decision& decision, bool asksAlways)
{
    if (decision.verdict == kq_logic::Verdict::Undecided)
        return kUndecided;
    return IsYes(decision, asksAlways) ? kDone : kFindings;
}

void PutText(const kq_logic::Decision& decision, bool asksAlways, double seconds, Output& output)
{
    if (IsEqual(decision))
        output.Put((asksAlways ? "always 1, over " : "never 1, over ") +
                   Count(decision.inputs.size(), "input") + "\n");
    else if (IsDifferent(decision))
        output.Put((asksAlways ? "not always 1, 0 " : "satisfiable, 1 ") + PlaceText(decision) +
                   "\n  " + ValuesByName(decision.inputs, decision.assignment) + "\n");
    else
        output.Put(UndecidedText(decision, seconds) + "\n");
}

Json AsJson(const kq_logic::Decision& decision, bool asksAlways)
{
    Json result;
    const bool isDecided = decision.verdict != kq_logic::Verdict::Undecided;
    result[asksAlways ? "always" : "satisfiable"] =
        isDecided ? Json(IsYes(decision, asksAlways)) : Json();
    result["inputs"] = decision.inputs;
    result["row"] = IsDifferent(decision) ? RowJson(decision) : Json();
    result["is_first"] = IsDifferent(decision) ? Json(decision.isFirstRow) : Json();
    result["assignment"] =
        IsDifferent(decision) ? AssignmentJson(decision.inputs, decision.assignment) : Json();
    if (!isDecided)
        result["reason"] = decision.reason;
    return result;
}

int RunSat(const Request& request, Output& output)
{
    CheckClauseOptions(request);
    const double seconds = ParseSeconds(request, 0);
    const bool asksAlways = request.Has("--always");
    return ForEachText(request, output, [&](const Text& text) {
        Kq_BoolEquation equation;
        if (!SetEquation(text, request, output, equation))
            return kRefused;
        kq_logic::Decision decision;
        int status = kDone;
        {
            const WorkingProgress progress;
            decision = kq_logic::DecideConstant(equation, asksAlways, {seconds});
            if (WantsClauses(request))
                status = WriteClauses(request, output,
                                      ClausesOfValue(ToExpression(equation), !asksAlways),
                                      decision.verdict, seconds);
        }
        const int answer = StatusOf(decision, asksAlways);
        const char* const word =
            answer == kUndecided ? "undecided" : (answer == kDone ? "yes" : "no");
        return Say(text, request, output,
                   {std::max(status, answer), word, LineMark::Prefix,
                    [&] { return AsJson(decision, asksAlways); },
                    [&] { PutText(decision, asksAlways, seconds, output); }});
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
        "Find an assignment that makes an equation 1, or prove there is none",
        "Prints the first such assignment, or above 30 inputs one of them. With --always it asks\n"
        "whether the equation is 1 for every assignment, and looks for one for which it is 0.\n"
        "Status 0: yes, 1: no, 4: not decided within --seconds. The clauses that --cnf writes are\n"
        "satisfied by exactly the assignments that it looks for.\n",
        Options(),
        {"booleq sat '(A | B) & ~A'", "booleq sat 'A & ~A'", "booleq sat --always 'A | ~A'",
         "booleq sat --cnf a.cnf --proof a.drat 'A & (B ^ A) & B'"},
        RunSat};
}

} // namespace booleq
