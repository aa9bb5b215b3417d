// The command 'eval': the value for one assignment.
#include <set>

#include "answer.h"
#include "commands.h"
#include "function.h"
#include "table_rows.h"
#include "text.h"

namespace booleq {

namespace {

struct Assignment {
    std::string name;
    unsigned int value = 0;
};

// "A=1"; the name may have a '=' inside quotes.  Fails: UsageError.
Assignment ParseAssignment(const std::string& word)
{
    const size_t sign = word.rfind('=');
    const std::string value = sign == std::string::npos ? std::string() : word.substr(sign + 1);
    if (sign == 0 || (value != "0" && value != "1"))
        throw UsageError("'" + Excerpt(word) + "' is not an assignment: write NAME=0 or NAME=1");
    return {word.substr(0, sign), value == "1" ? 1u : 0u};
}

std::vector<Assignment> ParseAssignments(const Request& request)
{
    std::vector<Assignment> assignments;
    std::set<std::string> names;
    for (size_t index = request.hasLines ? 0 : 1; index < request.operands.size(); ++index) {
        assignments.push_back(ParseAssignment(request.operands[index]));
        if (!names.insert(assignments.back().name).second)
            throw UsageError(Excerpt(assignments.back().name) + " is assigned twice");
    }
    return assignments;
}

// Why the assignments do not give one value for each input; empty when they do. One of many lines
// need not have all the inputs; those that it has are added to 'assigned'.
std::string Assign(Kq_BoolEquation& equation, const std::vector<Assignment>& assignments,
                   bool isLine, std::set<std::string>& assigned)
{
    std::set<std::string> inputs;
    for (const std::string& name : InputNames(equation))
        inputs.insert(name);
    for (const Assignment& assignment : assignments) {
        if (isLine && inputs.count(assignment.name) == 0)
            continue;
        if (!equation.SetVariable(assignment.name.c_str(), assignment.value))
            return "there is no input " + Excerpt(assignment.name);
        assigned.insert(assignment.name);
    }
    for (const std::string& name : InputNames(equation))
        if (assigned.count(name) == 0)
            return "no value for " + Excerpt(name) + ": write " + Excerpt(name) + "=0 or " +
                   Excerpt(name) + "=1";
    return std::string();
}

int RunEval(const Request& request, Output& output)
{
    const std::vector<Assignment> assignments = ParseAssignments(request);
    std::set<std::string> everAssigned;
    const int status = ForEachText(request, output, [&](const Text& text) {
        Kq_BoolEquation equation;
        if (!SetEquation(text, request, output, equation))
            return kRefused;
        std::set<std::string> assigned;
        const std::string fault = Assign(equation, assignments, text.line > 0, assigned);
        everAssigned.insert(assigned.begin(), assigned.end());
        if (!fault.empty() && text.line == 0)
            throw UsageError(fault);
        if (!fault.empty()) {
            Refuse(text, request, output, fault);
            return kRefused;
        }
        const unsigned int value = equation.Eval();
        if (request.json) {
            Json result;
            result["assignment"] = Json::object();
            for (const Assignment& assignment : assignments)
                if (assigned.count(assignment.name) != 0)
                    PutMember(result["assignment"], assignment.name, assignment.value);
            result["value"] = value;
            PutJson(text, request, "done", result, output);
        } else if (text.line > 0) {
            PutField(output, "line " + std::to_string(text.line), std::to_string(value));
        } else {
            output.Put(std::to_string(value) + "\n");
        }
        return kDone;
    });
    for (const Assignment& assignment : assignments)
        if (request.hasLines && everAssigned.count(assignment.name) == 0)
            Complain(output, "warning: no line has an input " + Excerpt(assignment.name));
    return status;
}

} // namespace

Command EvalCommand()
{
    return {"eval",
            "EQUATION [NAME=VALUE...]",
            1,
            kAnyNumber,
            "Print the value for one assignment",
            "Every input needs a value, 0 or 1; a missing value or an unknown name is an error\n"
            "(status 2). The value is printed; the status is 0 either way. When several lines are\n"
            "evaluated, each uses the values of the inputs it has.\n",
            {},
            {"booleq eval 'A & ~B' A=1 B=0", "booleq eval --inputs A,B 0x6 A=1 B=1",
             "booleq eval --file equations.txt A=1 B=0"},
            RunEval};
}

} // namespace booleq
