// The command 'equal': are two equations the same function.
#include "equality.h"

#include <algorithm>

#include "commands.h"
#include "decide.h"
#include "text.h"

namespace booleq {

namespace {

const char* StatusWord(const Decision& decision)
{
    if (decision.verdict == Verdict::Undecided)
        return "undecided";
    return decision.IsEqual() ? "yes" : "no";
}

int StatusOf(const Decision& decision)
{
    if (decision.verdict == Verdict::Undecided)
        return kUndecided;
    return decision.IsEqual() ? kDone : kFindings;
}

Json AsJson(const Decision& decision)
{
    Json result;
    const bool isDecided = decision.verdict != Verdict::Undecided;
    result["equal"] = isDecided ? Json(decision.IsEqual()) : Json();
    result["inputs"] = decision.inputs;
    result["first_difference"] = nullptr;
    if (decision.IsDifferent()) {
        Json& difference = result["first_difference"] = Json::object();
        difference["row"] = RowJson(decision);
        difference["is_first"] = decision.isFirstRow;
        difference["assignment"] = AssignmentJson(decision);
        difference["values"] = {decision.left ? 1 : 0, decision.right ? 1 : 0};
    }
    if (!isDecided)
        result["reason"] = decision.reason;
    return result;
}

void PutText(const Decision& decision, const Limits& limits, Output& output)
{
    if (decision.IsEqual())
        output.Put("equal, over " + Count(decision.inputs.size(), "input") + "\n");
    else if (decision.IsDifferent())
        output.Put("not equal, " + PlaceText(decision) + "\n  " + AssignmentLine(decision) + ": " +
                   (decision.left ? "1" : "0") + " and " + (decision.right ? "1" : "0") + "\n");
    else
        output.Put(UndecidedText(decision, limits) + "\n");
}

int RunEqual(const Request& request, Output& output)
{
    CheckClauseOptions(request);
    const Limits limits = ParseLimits(request, 0);
    const Text other{request.operands.back(), 0};
    Kq_BoolEquation right;
    if (!SetEquation(other, request, output, right))
        return kRefused;
    return ForEachText(request, output, [&](const Text& text) {
        Kq_BoolEquation left;
        if (!SetEquation(text, request, output, left))
            return kRefused;
        Decision decision;
        int status = kDone;
        {
            const DecidingProgress progress;
            decision = DecideEquations(left, right, limits);
            if (WantsClauses(request))
                status = WriteClauses(request, output,
                                      ClausesOfDifference(ToExpression(left), ToExpression(right)),
                                      decision.verdict, limits);
        }
        return Say(text, request, output,
                   {std::max(status, StatusOf(decision)), StatusWord(decision), LineMark::Prefix,
                    [&] { return AsJson(decision); }, [&] { PutText(decision, limits, output); }});
    });
}

std::vector<Option> Options()
{
    std::vector<Option> options = {SecondsOption()};
    for (const Option& option : ClauseOptions())
        options.push_back(option);
    return options;
}

} // namespace

Command EqualCommand()
{
    return {
        "equal",
        "EQUATION EQUATION",
        2,
        2,
        "Tell whether two equations are one function",
        "The answer is for every assignment of the inputs of both, however many they are. Up to "
        "30\n"
        "inputs the first assignment that differs is printed, above that one that differs. Status\n"
        "0: equal, 1: not, 4: not decided, when --seconds came first. With '-' or --file each "
        "line\n"
        "is compared with the one equation that is given. The clauses of --cnf can be satisfied\n"
        "when the equations differ; any solver reads them, and any checker the proof.\n",
        Options(),
        {"booleq equal '~(A & B)' '~A | ~B'", "booleq equal --inputs A,B 0x8 'A & B'",
         "booleq equal --file equations.txt 'A & B'"},
        RunEqual};
}

} // namespace booleq
