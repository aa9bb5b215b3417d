// The command 'permute': an init value for another order of the same inputs.
#include "permute.h"

#include <kq_logic/permute.h>

#include "answer.h"
#include "bit_orders.h"
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

void PutText(const kq_logic::Function& function, Output& output)
{
    std::string names = Visible(Join(function.Inputs(), ", "));
    if (function.NumInputs() > 1)
        names +=
            "; " + Visible(function.Inputs().front()) + " is the most significant, row k is bit k";
    PutField(output, "inputs", names);
    PutBitOrders(function, Reversed(function), output);
    const std::string split = FirstSplitName(function.Inputs());
    if (!split.empty())
        PutField(output, "note", "does not read back: " + Visible(SplitNameReason(split)));
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
        kq_logic::Function function;
        if (!SetFunction(text, own, output, function))
            return kRefused;
        const std::string unknown = FirstUnlisted(function.Inputs(), to);
        if (!unknown.empty()) {
            Refuse(text, own, output, Visible(unknown) + " is not in --from");
            return kRefused;
        }
        kq_logic::Function permuted;
        const std::string fault = kq_logic::Permute(function, to, permuted);
        if (!fault.empty()) {
            Refuse(text, own, output, fault);
            return kRefused;
        }
        const auto toJson = [&] {
            return Json{{"from", {{"inputs", function.Inputs()}, {"hex", function.Hex()}}},
                        {"inputs", to},
                        {"hex", permuted.Hex()},
                        {"binary", permuted.Binary()},
                        {"lsb_first", LsbFirstJson(permuted)}};
        };
        return Say(text, own, output,
                   {kDone, "done", LineMark::Block, toJson, [&] { PutText(permuted, output); }});
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
        "Rewrite an init value for another order of its inputs",
        "Both lists begin with the most significant input. A name that only --to lists widens the\n"
        "table by an input without effect. At most 24 inputs.\n",
        {{"--from", "A,B,C", "The inputs of the given value, most significant first"},
         {"--to", "C,A,B", "The inputs of the value to print"}},
        {"booleq permute 0xca --from S,A,B --to A,B,S"},
        RunPermute};
}

} // namespace booleq
