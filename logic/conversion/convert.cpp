#include "convert.h"

#include <algorithm>
#include <unordered_map>

#include "cover.h"
#include "foreign_tree.h"
#include "names.h"
#include "network.h"
#include "notation.h"
#include "notation_writer.h"
#include "text.h"
#include "word_comparison.h"

namespace booleq {

namespace {

const Notation* NotationOf(Target target)
{
    switch (target) {
    case Target::Verilog:
        return &VerilogNotation();
    case Target::Vhdl:
        return &VhdlNotation();
    case Target::C:
        return &CNotation();
    case Target::Python:
        return &PythonNotation();
    case Target::Liberty:
        return &LibertyNotation();
    case Target::Eqn:
        return &EqnNotation();
    case Target::Primary:
    case Target::Alt1:
    case Target::Alt2:
    case Target::Alt3:
    case Target::Paren:
    case Target::Blif:
    case Target::Pla:
        break;
    }
    return nullptr;
}

std::string WriteForLibrary(const Expression& expression, Target target)
{
    if (target == Target::Primary)
        return WriteOwn(expression, OwnSyntax::AsTyped, Parentheses::Needed);
    if (target == Target::Alt2)
        return WriteOwn(expression, OwnSyntax::Second, Parentheses::Needed);
    if (target == Target::Alt3)
        return WriteOwn(expression, OwnSyntax::Third, Parentheses::Needed);
    return WriteOwn(expression, OwnSyntax::First,
                    target == Target::Paren ? Parentheses::Whole : Parentheses::Needed);
}

// What a reading gives: the function, and what evaluating it takes; or nothing.
struct Reread {
    WordFunction function;
    uint64_t cost = 0;
};

bool ReadLibrary(const std::string& text, const Expression& expression, Reread& reread)
{
    std::vector<Port::StringBase<char>> inputs;
    for (const std::string& name : expression.names)
        inputs.push_back(Port::StringBase<char>(name.c_str()));
    Kq_BoolEquation equation;
    if (!equation.SetEquationWithExplicitTerms(inputs, text.c_str(), false, false) ||
        equation.GetNumVariables() != expression.names.size())
        return false;
    const Expression again = ToExpression(equation);
    reread.cost = again.nodes.size();
    reread.function = [again](const std::vector<uint64_t>& values) {
        std::vector<uint64_t> stack;
        return EvaluateWord(again, values, stack);
    };
    return true;
}

// The tree's names are inputs in the order of the text; the function takes them in their own.
bool ReadForeign(const std::string& text, const Notation& notation,
                 const std::vector<std::string>& names, Reread& reread)
{
    ForeignTree tree;
    std::string fault;
    if (!Read(text, notation, tree, fault))
        return false;
    std::unordered_map<std::string, uint32_t> numbers;
    for (size_t input = 0; input < names.size(); ++input)
        numbers[CanonicalName(notation, names[input])] = static_cast<uint32_t>(input);
    for (ForeignTree::Node& node : tree.nodes) {
        if (node.meaning != Meaning::Input)
            continue;
        const auto found = numbers.find(tree.names[node.left]);
        if (found == numbers.end())
            return false;
        node.left = found->second;
    }
    Expression again;
    if (!ToExpression(tree, again))
        return false;
    reread.cost = again.nodes.size();
    reread.function = [again](const std::vector<uint64_t>& values) {
        std::vector<uint64_t> stack;
        return EvaluateWord(again, values, stack);
    };
    return true;
}

bool ReadNetwork(const std::string& text, Target target, Reread& reread)
{
    Network network;
    const bool isRead = target == Target::Blif  ? ReadBlif(text, network)
                        : target == Target::Pla ? ReadPla(text, network)
                                                : ReadEqn(text, network);
    if (!isRead)
        return false;
    for (const Network::Definition& definition : network.definitions)
        reread.cost += definition.expression.nodes.size();
    reread.function = ToWordFunction(network);
    return true;
}

std::string WriteNetwork(const Expression& expression, Target target, const Conversion& conversion,
                         std::string& fault)
{
    const NetworkNames names = {conversion.names, conversion.output, conversion.unit};
    if (target == Target::Blif)
        return WriteBlif(expression, names);
    if (target == Target::Eqn)
        return WriteEqn(expression, names);
    if (expression.names.size() > kMaxCoverInputs || expression.names.empty()) {
        fault = "a pla is written for 1 to " + std::to_string(kMaxCoverInputs) +
                " inputs; this has " + std::to_string(expression.names.size());
        return std::string();
    }
    return WritePla(FindCover(Bits(ToFunction(expression))), names);
}

std::string Listed(const std::vector<std::string>& names, const char* before, const char* between)
{
    std::string text;
    for (const std::string& name : names)
        text += (text.empty() ? "" : between) + (before + name);
    return text;
}

std::string InVerilogModule(const std::string& text, const Conversion& conversion)
{
    std::string ports;
    for (const std::string& name : conversion.names)
        ports += "    input " + name + ",\n";
    return "module " + conversion.unit + " (\n" + ports + "    output " + conversion.output +
           "\n);\n    assign " + conversion.output + " = " + text + ";\nendmodule\n";
}

std::string InVhdlEntity(const std::string& text, const Conversion& conversion)
{
    std::string ports;
    for (const std::string& name : conversion.names)
        ports += "        " + name + " : in std_logic;\n";
    return "library ieee;\nuse ieee.std_logic_1164.all;\n\nentity " + conversion.unit +
           " is\n    port (\n" + ports + "        " + conversion.output +
           " : out std_logic\n    );\nend entity;\n\narchitecture equation of " + conversion.unit +
           " is\nbegin\n    " + conversion.output + " <= " + text + ";\nend architecture;\n";
}

std::string InCFunction(const std::string& text, const Conversion& conversion)
{
    const std::string parameters =
        conversion.names.empty() ? "void" : Listed(conversion.names, "bool ", ", ");
    return "#include <stdbool.h>\n\nbool " + conversion.unit + "(" + parameters +
           ")\n{\n    return " + text + ";\n}\n";
}

// Inputs are 0 and 1 or truth values; the result is 0 or 1. No name of a built-in function stands
// there, as an input may have it.
std::string InPythonFunction(const std::string& text, const Conversion& conversion)
{
    return "def " + conversion.unit + "(" + Listed(conversion.names, "", ", ") +
           "):\n    return 1 if " + text + " else 0\n";
}

std::string InLibertyCell(const std::string& text, const Conversion& conversion)
{
    std::string pins;
    for (const std::string& name : conversion.names)
        pins += "    pin (" + name + ") {\n        direction : input;\n    }\n";
    return "cell (" + conversion.unit + ") {\n" + pins + "    pin (" + conversion.output +
           ") {\n        direction : output;\n        function : \"" + text + "\";\n    }\n}\n";
}

std::string CommentStart(Target target)
{
    if (target == Target::Verilog || target == Target::C)
        return "// ";
    if (target == Target::Vhdl)
        return "-- ";
    return "# ";
}

// What the file says of names that are not those of the equation. Liberty has no line of comment,
// so its map goes between marks.
std::string NameComments(const Expression& expression, Target target, const Conversion& conversion)
{
    std::string text;
    for (const auto& change : ChangedNames(expression, conversion)) {
        std::string line = Visible(change.first) + " is " + change.second;
        // A mark inside a name must not end the comment.
        for (size_t mark = line.find("*/"); mark != std::string::npos; mark = line.find("*/"))
            line.replace(mark, 2, "*\\x2f");
        text +=
            target == Target::Liberty ? "/* " + line + " */\n" : CommentStart(target) + line + "\n";
    }
    return text;
}

std::string Wrapped(const std::string& text, Target target, const Conversion& conversion)
{
    if (target == Target::Verilog)
        return InVerilogModule(text, conversion);
    if (target == Target::Vhdl)
        return InVhdlEntity(text, conversion);
    if (target == Target::C)
        return InCFunction(text, conversion);
    if (target == Target::Python)
        return InPythonFunction(text, conversion);
    if (target == Target::Liberty)
        return InLibertyCell(text, conversion);
    return text;
}

void NameEverything(const Expression& expression, Target target, const std::string& unit,
                    Conversion& conversion)
{
    conversion.names = expression.names;
    if (target <= Target::Paren)
        return;
    TargetNamer namer(NotationOf(target));
    conversion.names = namer.NameInputs(expression.names);
    if (unit.empty() && WrappingOf(target) != Wrapping::Always)
        return;
    conversion.output = namer.NameOther("y");
    conversion.unit = namer.NameOther(unit.empty() ? "f" : unit);
}

} // namespace

const std::vector<const char*>& TargetNames()
{
    static const std::vector<const char*> kNames = {"primary", "alt1", "alt2", "alt3",   "paren",
                                                    "verilog", "vhdl", "c",    "python", "liberty",
                                                    "blif",    "pla",  "eqn"};
    return kNames;
}

bool FindTarget(const std::string& name, Target& target)
{
    const auto found = std::find(TargetNames().begin(), TargetNames().end(), name);
    if (found == TargetNames().end())
        return false;
    target = static_cast<Target>(found - TargetNames().begin());
    return true;
}

Wrapping WrappingOf(Target target)
{
    if (target <= Target::Paren)
        return Wrapping::Never;
    return target >= Target::Blif ? Wrapping::Always : Wrapping::Optional;
}

Conversion Convert(const Expression& expression, Target target, const std::string& unit)
{
    Conversion conversion;
    NameEverything(expression, target, unit, conversion);
    const Notation* notation = NotationOf(target);
    Reread reread;
    bool isRead = false;
    std::string text;
    if (target <= Target::Paren) {
        text = WriteForLibrary(expression, target);
        isRead = ReadLibrary(text, expression, reread);
    } else if (WrappingOf(target) == Wrapping::Always) {
        text = WriteNetwork(expression, target, conversion, conversion.fault);
        if (!conversion.fault.empty())
            return conversion;
        isRead = ReadNetwork(text, target, reread);
    } else {
        text = Write(expression, *notation, conversion.names);
        isRead = ReadForeign(text, *notation, conversion.names, reread);
    }
    std::vector<uint64_t> stack;
    const auto original = [&](const std::vector<uint64_t>& inputs) {
        return EvaluateWord(expression, inputs, stack);
    };
    Comparison comparison;
    if (isRead)
        comparison = CompareWords(original, reread.function,
                                  static_cast<unsigned int>(expression.names.size()),
                                  expression.nodes.size() + reread.cost);
    if (!isRead || !comparison.isEqual) {
        conversion.fault = "the text written does not read back as this function";
        return conversion;
    }
    conversion.isExhaustive = comparison.isExhaustive;
    conversion.numAssignments = comparison.numAssignments;
    // Some readers of eqn files stumble over lines of comment.
    conversion.saysNames = !conversion.unit.empty() && target != Target::Eqn;
    if (conversion.saysNames)
        conversion.text = NameComments(expression, target, conversion);
    conversion.text += conversion.unit.empty() ? text : Wrapped(text, target, conversion);
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
