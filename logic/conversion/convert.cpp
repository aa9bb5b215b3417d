#include "convert.h"

#include <algorithm>
#include <cassert>

#include "decision.h"
#include "flatten.h"
#include "names.h"
#include "text.h"

namespace booleq {

namespace {

void NameEverything(const Expression& expression, const Target& target, const std::string& unit,
                    UnitNames& names)
{
    names.inputs = expression.names;
    if (target.wrapping == Wrapping::Never)
        return;
    TargetNamer namer(target.notation ? &target.notation() : nullptr);
    names.inputs = namer.NameInputs(expression.names);
    if (unit.empty() && target.wrapping != Wrapping::Always)
        return;
    names.output = namer.NameOther("y");
    names.unit = namer.NameOther(unit.empty() ? "f" : unit);
}

// The comments of the file about names that differ from those of the equation.
std::string NameComments(const Expression& expression, const Target& target,
                         const Conversion& conversion)
{
    std::string text;
    for (const auto& change : ChangedNames(expression.names, conversion.names)) {
        std::string line = Visible(change.first) + " is " + change.second;
        // A mark inside a name must not end the comment.
        for (size_t mark = line.find("*/"); mark != std::string::npos; mark = line.find("*/"))
            line.replace(mark, 2, "*\\x2f");
        text += target.commentStart + line + target.commentEnd + "\n";
    }
    return text;
}

// Each signal is one edge of the graph, however often it is used.
Side SideOf(const Network& network, const std::vector<std::string>& names)
{
    const auto build = [&network](const std::vector<Edge>& inputs, GateGraph& graph) {
        std::vector<Edge> signals(network.signals.size(), kFalseEdge);
        std::copy(inputs.begin(), inputs.end(), signals.begin());
        for (const Network::Definition& definition : network.definitions)
            signals[definition.signal] = AddExpression(definition.expression, signals, graph);
        return signals[network.output];
    };
    return {names, build, ToWordFunction(network)};
}

// Whether the written text says what was meant.
Decision Check(const Expression& expression, Reread& reread, const Limits& limits)
{
    if (reread.isNetwork)
        return DecideEqual(SideOf(expression), SideOf(reread.network, expression.names), limits);
    reread.expression.names = expression.names; // by place: the text spells them differently
    return DecideEqual(expression, reread.expression, limits);
}

} // namespace

Conversion Convert(const Expression& expression, const Target& target, const std::string& unit,
                   const Limits& limits)
{
    Conversion conversion;
    UnitNames names;
    NameEverything(expression, target, unit, names);
    assert(names.inputs.size() == expression.names.size());
    const std::string text = target.write(expression, target, names, conversion.fault);
    if (!conversion.fault.empty())
        return conversion;
    Reread reread;
    Decision decision;
    const bool isRead = target.readAgain(text, target, names, reread);
    if (isRead)
        decision = Check(expression, reread, limits);
    if (!isRead || decision.IsDifferent()) {
        conversion.fault = "the text written does not read back as this function";
        return conversion;
    }
    conversion.isProved = decision.IsEqual();
    conversion.doubt = decision.reason;
    conversion.names = names.inputs;
    conversion.output = names.output;
    conversion.unit = names.unit;
    conversion.saysNames = !names.unit.empty() && target.commentStart;
    if (conversion.saysNames)
        conversion.text = NameComments(expression, target, conversion);
    conversion.text += !names.unit.empty() && target.wrap ? target.wrap(text, names) : text;
    if (conversion.text.back() != '\n')
        conversion.text += '\n';
    return conversion;
}

std::vector<std::pair<std::string, std::string>>
ChangedNames(const std::vector<std::string>& inputs, const std::vector<std::string>& names)
{
    assert(names.empty() || names.size() == inputs.size());
    std::vector<std::pair<std::string, std::string>> changes;
    for (size_t input = 0; input < names.size(); ++input)
        if (inputs[input] != names[input])
            changes.emplace_back(inputs[input], names[input]);
    return changes;
}

} // namespace booleq
