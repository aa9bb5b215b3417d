// The command 'equal': are two equations the same function.
#include <algorithm>

#include "answer.h"
#include "commands.h"
#include "core/text.h"
#include "options.h"

namespace booleq {

namespace {

std::vector<std::string> Union(const Function& left, const Function& right)
{
    std::vector<std::string> names = left.Inputs();
    for (const std::string& name : right.Inputs())
        if (std::find(names.begin(), names.end(), name) == names.end())
            names.push_back(name);
    return names;
}

std::string AssignmentText(const Function& function, uint64_t row)
{
    std::string text;
    for (size_t index = 0; index < function.NumInputs(); ++index)
        text += (index == 0 ? "" : " ") + Visible(function.Inputs()[index]) +
                (function.InputAt(row, index) ? "=1" : "=0");
    return text.empty() ? "no inputs" : text;
}

Json AsJson(const Function& left, const Function& right, uint64_t row)
{
    Json result;
    result["equal"] = row == Function::kNoRow;
    result["inputs"] = left.Inputs();
    result["first_difference"] = nullptr;
    if (row != Function::kNoRow) {
        Json& difference = result["first_difference"] = Json::object();
        difference["row"] = row;
        difference["assignment"] = Json::object();
        for (size_t index = 0; index < left.NumInputs(); ++index)
            difference["assignment"][left.Inputs()[index]] = left.InputAt(row, index) ? 1 : 0;
        difference["values"] = {left.At(row) ? 1 : 0, right.At(row) ? 1 : 0};
    }
    return result;
}

void PutText(const Text& text, const Function& left, const Function& right, uint64_t row,
             Output& output)
{
    const std::string place = text.line > 0 ? "line " + std::to_string(text.line) + ": " : "";
    if (row == Function::kNoRow) {
        output.Put(place + "equal, over " + Count(left.NumInputs(), "input") + "\n");
        return;
    }
    output.Put(place + "not equal, first at row " + std::to_string(row) + " of " +
               std::to_string(left.NumRows()) + "\n  " + AssignmentText(left, row) + ": " +
               (left.At(row) ? "1" : "0") + " and " + (right.At(row) ? "1" : "0") + "\n");
}

int RunEqual(const Request& request, Output& output)
{
    const Text other{request.operands.back(), 0};
    Function right;
    if (!SetFunction(other, request, output, right))
        return kRefused;
    return ForEachText(request, output, [&](const Text& text) {
        Function left;
        if (!SetFunction(text, request, output, left))
            return kRefused;
        const std::vector<std::string> names = Union(left, right);
        if (names.size() > kMaxFunctionInputs) {
            Refuse(text, request, output,
                   std::to_string(names.size()) + " inputs together: at most " +
                       std::to_string(kMaxFunctionInputs) + " are compared");
            return kRefused;
        }
        const Function wideLeft = left.Over(names);
        const Function wideRight = right.Over(names);
        const uint64_t row = wideLeft.FirstDifference(wideRight);
        const bool isEqual = row == Function::kNoRow;
        if (request.json)
            PutJson(text, request, isEqual ? "yes" : "no", AsJson(wideLeft, wideRight, row),
                    output);
        else
            PutText(text, wideLeft, wideRight, row, output);
        return isEqual ? kDone : kFindings;
    });
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
        "They are compared for every assignment of the inputs of both, at most 30 together; the\n"
        "first assignment that differs is printed. Status 0: equal, 1: not. With '-' or --file\n"
        "each line is compared with the one equation that is given.\n",
        {},
        {"booleq equal '~(A & B)' '~A | ~B'", "booleq equal --inputs A,B 0x8 'A & B'",
         "booleq equal --file equations.txt 'A & B'"},
        RunEqual};
}

} // namespace booleq
