#include "convert.h"

#include <cassert>

#include "names.h"
#include "text.h"
#include "word_comparison.h"

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

// What the file says of names that are not those of the equation.
std::string NameComments(const Expression& expression, const Target& target,
                         const Conversion& conversion)
{
    std::string text;
    for (const auto& change : ChangedNames(expression, conversion)) {
        std::string line = Visible(change.first) + " is " + change.second;
        // A mark inside a name must not end the comment.
        for (size_t mark = line.find("*/"); mark != std::string::npos; mark = line.find("*/"))
            line.replace(mark, 2, "*\\x2f");
        text += target.commentStart + line + target.commentEnd + "\n";
    }
    return text;
}

// Whether the text says the same as the expression.
bool ReadsBack(const Expression& expression, const Target& target, const UnitNames& names,
               const std::string& text, Conversion& conversion)
{
    Reread reread;
    if (!target.readAgain(text, target, names, reread))
        return false;
    std::vector<uint64_t> stack;
    const auto original = [&](const std::vector<uint64_t>& inputs) {
        return EvaluateWord(expression, inputs, stack);
    };
    const Comparison comparison =
        CompareWords(original, reread.function, static_cast<unsigned int>(expression.names.size()),
                     expression.nodes.size() + reread.cost);
    conversion.isExhaustive = comparison.isExhaustive;
    conversion.numAssignments = comparison.numAssignments;
    return comparison.isEqual;
}

} // namespace

Conversion Convert(const Expression& expression, const Target& target, const std::string& unit)
{
    Conversion conversion;
    UnitNames names;
    NameEverything(expression, target, unit, names);
    assert(names.inputs.size() == expression.names.size());
    const std::string text = target.write(expression, target, names, conversion.fault);
    if (!conversion.fault.empty())
        return conversion;
    if (!ReadsBack(expression, target, names, text, conversion)) {
        conversion.fault = "the text written does not read back as this function";
        return conversion;
    }
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

std::vector<std::pair<std::string, std::string>> ChangedNames(const Expression& expression,
                                                              const Conversion& conversion)
{
    std::vector<std::pair<std::string, std::string>> changes;
    for (size_t input = 0; input < conversion.names.size(); ++input)
        if (expression.names[input] != conversion.names[input])
            changes.emplace_back(expression.names[input], conversion.names[input]);
    return changes;
}

} // namespace booleq
