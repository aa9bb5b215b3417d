// The command 'permute': an init value for another order of the same inputs.
#include "permute.h"

#include "answer.h"
#include "commands.h"
#include "text.h"

namespace booleq {

namespace {

std::vector<std::string> ParseNames(const Request& request, const char* option)
{
    const std::string list = request.Get(option);
    std::vector<std::string> names;
    if (IsBlank(list))
        throw UsageError("permute needs --from and --to: --from A,B,C --to C,A,B");
    if (!SplitInputs(list, names))
        throw UsageError(std::string(option) +
                         " has a single quote that is not closed: " + Excerpt(list));
    const std::string fault = OrderFault(names);
    if (!fault.empty())
        throw UsageError(std::string(option) + ": " + fault);
    if (names.size() > kMaxPermuteInputs)
        throw UsageError(std::string(option) + " has " + Count(names.size(), "input") +
                         ": at most " + std::to_string(kMaxPermuteInputs));
    return names;
}

void PutText(const Text& text, const Function& function, Output& output)
{
    if (text.line > 0)
        PutField(output, "line", std::to_string(text.line));
    std::string names;
    for (const std::string& name : function.Inputs())
        names += (names.empty() ? "" : ", ") + Visible(name);
    if (function.NumInputs() > 1)
        names +=
            "; " + Visible(function.Inputs().front()) + " is the most significant, row k is bit k";
    PutField(output, "inputs", names);
    PutField(output, "init value hex", function.Hex());
    PutField(output, "init value bin", function.Binary());
    if (text.line > 0)
        output.Put("\n");
}

int RunPermute(const Request& request, Output& output)
{
    if (request.reading.hasInputs)
        throw UsageError("permute takes --from in place of --inputs");
    Request own = request;
    own.reading.hasInputs = true;
    own.reading.inputs = ParseNames(request, "--from");
    const std::vector<std::string> to = ParseNames(request, "--to");
    const std::string forgotten = FirstUnlisted(own.reading.inputs, to);
    if (!forgotten.empty())
        throw UsageError("--to does not list " + Excerpt(forgotten));
    return ForEachText(own, output, [&](const Text& text) {
        Function function;
        if (!SetFunction(text, own, output, function))
            return kRefused;
        const std::string unknown = FirstUnlisted(function.Inputs(), to);
        if (!unknown.empty()) {
            Refuse(text, own, output, Visible(unknown) + " is not in --from");
            return kRefused;
        }
        const Function permuted = function.Over(to);
        if (own.json) {
            const Json result = {{"from", {{"inputs", function.Inputs()}, {"hex", function.Hex()}}},
                                 {"inputs", to},
                                 {"hex", permuted.Hex()},
                                 {"binary", permuted.Binary()}};
            PutJson(text, own, "done", result, output);
        } else {
            PutText(text, permuted, output);
        }
        return kDone;
    });
}

} // namespace

Command PermuteCommand()
{
    return {
        "permute",
        "INIT|EQUATION",
        1,
        1,
        "Write an init value for another order of its inputs",
        "Both lists begin with the most significant input. Names that only --to lists widen the\n"
        "table by an input without effect. At most 24 inputs.\n",
        {{"--from", "A,B,C", "The inputs of the given value, most significant first"},
         {"--to", "C,A,B", "The inputs of the value to print"}},
        {"booleq permute 0xca --from S,A,B --to A,B,S"},
        RunPermute};
}

} // namespace booleq
