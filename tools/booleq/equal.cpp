// The command 'equal': whether two equations are the same function.
#include <algorithm>

#include "commands.h"
#include "decide.h"
#include "text.h"

namespace booleq {

namespace {

const char* StatusWord(const kq_logic::Decision& decision)
{
    if (decision.verdict == kq_logic::Verdict::Undecided)
        return "undecided";
    return IsEqual(decision) ? "yes" : "no";
}

int StatusOf(const kq_logic::Decision& decision)
{
    if (decision.verdict == kq_logic::Verdict::Undecided)
        return kUndecided;
    return IsEqual(decision) ? kDone : kFindings;
}

Json AsJson(const kq_logic::Decision& decision)
{
    Json result;
    const bool isDecided = decision.verdict != kq_logic::Verdict::Undecided;
    result["equal"] = isDecided ? Json(IsEqual(decision)) : Json();
    result["inputs"] = decision.inputs;
    result["first_difference"] = nullptr;
    if (IsDifferent(decision)) {
        Json& difference = result["first_difference"] = Json::object();
        difference["row"] = RowJson(decision);
        difference["is_first"] = decision.isFirstRow;
        difference["assignment"] = AssignmentJson(decision.inputs, decision.assignment);
        difference["values"] = {decision.left ? 1 : 0, decision.right ? 1 : 0};
    }
    if (!isDecided)
        result["reason"] = decision.reason;
    return result;
}

void PutText(const kq_logic::Decision& decision, double seconds, Output& output)
{
    if (IsEqual(decision))
        output.Put("equal, over " + Count(decision.inputs.size(), "input") + "\n");
    else if (IsDifferent(decision))
        output.Put("not equal, " + PlaceText(decision) + "\n  " +
                   ValuesByName(decision.inputs, decision.assignment) + ": " +
                   (decision.left ? "1" : "0") + " and " + (decision.right ? "1" : "0") + "\n");
    else
        output.Put(UndecidedText(decision, seconds) + "\n");
}

int RunEqual(const Request& request, Output& output)
{
    CheckClauseOptions(request);
    const double seconds = ParseSeconds(request, 0);
    const Text other{request.operands.back(), 0};
    Kq_BoolEquation right;
    if (!SetEquation(other, request, output, right))
        return kRefused;
    return ForEachText(request, output, [&](const Text& text) {
        Kq_BoolEquation left;
        if (!SetEquation(text, request, output, left))
            return kRefused;
        kq_logic::Decision decision;
        int status = kDone;
        {
            const WorkingProgress progress;
            decision = kq_logic::DecideEqual(left, right, {seconds});
            if (WantsClauses(request))
                status = WriteClauses(request, output,
                                      ClausesOfDifference(ToExpression(left), ToExpression(right)),
                                      decision.verdict, seconds);
        }
        return Say(text, request, output,
                   {std::max(status, StatusOf(decision)), StatusWord(decision), LineMark::Prefix,
                    [&] { return AsJson(decision); }, [&] { PutText(decision, seconds, output); }});
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
        "Tell whether two equations are the same function",
        "Compares the two for every assignment of their inputs, however many there are. If they\n"
        "differ, it prints the first assignment where they do (above 30 inputs, one such\n"
        "assignment). Status 0: equal, 1: not equal, 4: not decided within --seconds. With '-' or\n"
        "--file, each line is compared with the one equation given. The clauses that --cnf writes\n"
        "are satisfiable exactly when the equations differ; any solver reads them, and any\n"
        "checker the proof.\n",
        Options(),
        {"booleq equal '~(A & B)' '~A | ~B'", "booleq equal --inputs A,B 0x8 'A & B'",
         "booleq equal --file equations.txt 'A & B'"},
        RunEqual};
}

} // namespace booleq
