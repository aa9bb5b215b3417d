// The command 'equal': are two equations the same function.
#include "equality.h"

#include "answer.h"
#include "commands.h"
#include "text.h"

namespace booleq {

namespace {

std::string AssignmentText(const Equality& equality)
{
    std::string text;
    for (size_t index = 0; index < equality.inputs.size(); ++index)
        text += (index == 0 ? "" : " ") + Visible(equality.inputs[index]) +
                (equality.InputAt(index) ? "=1" : "=0");
    return text.empty() ? "no inputs" : text;
}

Json AsJson(const Equality& equality)
{
    Json result;
    result["equal"] = equality.IsEqual();
    result["inputs"] = equality.inputs;
    result["first_difference"] = nullptr;
    if (!equality.IsEqual()) {
        Json& difference = result["first_difference"] = Json::object();
        difference["row"] = equality.row;
        difference["assignment"] = Json::object();
        for (size_t index = 0; index < equality.inputs.size(); ++index)
            difference["assignment"][equality.inputs[index]] = equality.InputAt(index) ? 1 : 0;
        difference["values"] = {equality.left ? 1 : 0, equality.right ? 1 : 0};
    }
    return result;
}

void PutText(const Text& text, const Equality& equality, Output& output)
{
    const std::string place = text.line > 0 ? "line " + std::to_string(text.line) + ": " : "";
    if (equality.IsEqual()) {
        output.Put(place + "equal, over " + Count(equality.inputs.size(), "input") + "\n");
        return;
    }
    output.Put(place + "not equal, first at row " + std::to_string(equality.row) + " of " +
               std::to_string(equality.NumRows()) + "\n  " + AssignmentText(equality) + ": " +
               (equality.left ? "1" : "0") + " and " + (equality.right ? "1" : "0") + "\n");
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
        const Equality equality = CompareFunctions(left, right);
        if (!equality.fault.empty()) {
            Refuse(text, request, output, equality.fault);
            return kRefused;
        }
        if (request.json)
            PutJson(text, request, equality.IsEqual() ? "yes" : "no", AsJson(equality), output);
        else
            PutText(text, equality, output);
        return equality.IsEqual() ? kDone : kFindings;
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
