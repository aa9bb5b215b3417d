#include "target.h"

#include <algorithm>
#include <cassert>
#include <iterator>
#include <unordered_map>

#include "cover.h"
#include "foreign_tree.h"
#include "listed_inputs.h"
#include "notation_writer.h"
#include "text.h"

namespace booleq {

namespace {

template <OwnSyntax syntax, Parentheses parentheses>
std::string WriteInSyntax(const Expression& expression, const Target& /*target*/,
                          const UnitNames& /*names*/, std::string& /*fault*/)
{
    return WriteOwn(expression, syntax, parentheses);
}

bool ReadOwn(const std::string& text, const Target& /*target*/, const UnitNames& names,
             Reread& reread)
{
    Reading reading;
    reading.hasInputs = true;
    reading.inputs = names.inputs;
    Kq_BoolEquation equation;
    if (!SetFromText(equation, text, reading) || equation.GetNumVariables() != names.inputs.size())
        return false;
    reread.expression = ToExpression(equation);
    return true;
}

// The tree's names are inputs in the order of the text; the function takes them in its own order.
bool ReadForeign(const std::string& text, const Target& target, const UnitNames& names,
                 Reread& reread)
{
    const Notation& notation = target.notation();
    ForeignTree tree;
    std::string fault;
    if (!Read(text, notation, tree, fault))
        return false;
    std::unordered_map<std::string, uint32_t> numbers;
    for (size_t input = 0; input < names.inputs.size(); ++input)
        numbers[CanonicalName(notation, names.inputs[input])] = static_cast<uint32_t>(input);
    for (ForeignTree::Node& node : tree.nodes) {
        if (node.meaning != Meaning::Input)
            continue;
        const auto found = numbers.find(tree.names[node.left]);
        if (found == numbers.end())
            return false;
        node.left = found->second;
    }
    return ToExpression(tree, reread.expression);
}

std::string WriteForeign(const Expression& expression, const Target& target, const UnitNames& names,
                         std::string& /*fault*/)
{
    return Write(expression, target.notation(), names.inputs);
}

template <std::string (*write)(const Expression&, const UnitNames&)>
std::string WriteFile(const Expression& expression, const Target& /*target*/,
                      const UnitNames& names, std::string& /*fault*/)
{
    return write(expression, names);
}

std::string WriteTable(const Expression& expression, const Target& /*target*/,
                       const UnitNames& names, std::string& fault)
{
    if (expression.names.size() <= kMaxCoverInputs && !expression.names.empty())
        return WritePla(FindCover(ToFunction(expression).GetRows()), names);
    fault = "a pla is written for 1 to " + std::to_string(kMaxCoverInputs) + " inputs; this has " +
            std::to_string(expression.names.size());
    return std::string();
}

template <bool (*read)(const std::string&, Network&)>
bool ReadFile(const std::string& text, const Target& /*target*/, const UnitNames& names,
              Reread& reread)
{
    reread.isNetwork = true;
    return read(text, reread.network) && reread.network.numInputs == names.inputs.size();
}

std::string InVerilogModule(const std::string& text, const UnitNames& names)
{
    std::string ports;
    for (const std::string& name : names.inputs)
        ports += "    input " + name + ",\n";
    return "module " + names.unit + " (\n" + ports + "    output " + names.output +
           "\n);\n    assign " + names.output + " = " + text + ";\nendmodule\n";
}

std::string InVhdlEntity(const std::string& text, const UnitNames& names)
{
    std::string ports;
    for (const std::string& name : names.inputs)
        ports += "        " + name + " : in std_logic;\n";
    return "library ieee;\nuse ieee.std_logic_1164.all;\n\nentity " + names.unit +
           " is\n    port (\n" + ports + "        " + names.output +
           " : out std_logic\n    );\nend entity;\n\narchitecture equation of " + names.unit +
           " is\nbegin\n    " + names.output + " <= " + text + ";\nend architecture;\n";
}

std::string InCFunction(const std::string& text, const UnitNames& names)
{
    const std::string parameters =
        names.inputs.empty() ? "void" : "bool " + Join(names.inputs, ", bool ");
    return "#include <stdbool.h>\n\nbool " + names.unit + "(" + parameters + ")\n{\n    return " +
           text + ";\n}\n";
}

// Inputs are 0 and 1 or truth values; the result is 0 or 1. The text uses no name of a built-in
// function, because an input may have that name.
std::string InPythonFunction(const std::string& text, const UnitNames& names)
{
    return "def " + names.unit + "(" + Join(names.inputs, ", ") + "):\n    return 1 if " + text +
           " else 0\n";
}

std::string InLibertyCell(const std::string& text, const UnitNames& names)
{
    std::string pins;
    for (const std::string& name : names.inputs)
        pins += "    pin (" + name + ") {\n        direction : input;\n    }\n";
    return "cell (" + names.unit + ") {\n" + pins + "    pin (" + names.output +
           ") {\n        direction : output;\n        function : \"" + text + "\";\n    }\n}\n";
}

// Some readers of eqn files fail on comment lines.
constexpr const char* kNoComments = nullptr;

constexpr Target kTargets[] = {
    {"primary", nullptr, Wrapping::Never, WriteInSyntax<OwnSyntax::AsTyped, Parentheses::Needed>,
     ReadOwn, nullptr, kNoComments, ""},
    {"alt1", nullptr, Wrapping::Never, WriteInSyntax<OwnSyntax::First, Parentheses::Needed>,
     ReadOwn, nullptr, kNoComments, ""},
    {"alt2", nullptr, Wrapping::Never, WriteInSyntax<OwnSyntax::Second, Parentheses::Needed>,
     ReadOwn, nullptr, kNoComments, ""},
    {"alt3", nullptr, Wrapping::Never, WriteInSyntax<OwnSyntax::Third, Parentheses::Needed>,
     ReadOwn, nullptr, kNoComments, ""},
    {"paren", nullptr, Wrapping::Never, WriteInSyntax<OwnSyntax::First, Parentheses::Whole>,
     ReadOwn, nullptr, kNoComments, ""},
    {"verilog", VerilogNotation, Wrapping::Optional, WriteForeign, ReadForeign, InVerilogModule,
     "// ", ""},
    {"vhdl", VhdlNotation, Wrapping::Optional, WriteForeign, ReadForeign, InVhdlEntity, "-- ", ""},
    {"c", CNotation, Wrapping::Optional, WriteForeign, ReadForeign, InCFunction, "// ", ""},
    {"python", PythonNotation, Wrapping::Optional, WriteForeign, ReadForeign, InPythonFunction,
     "# ", ""},
    {"liberty", LibertyNotation, Wrapping::Optional, WriteForeign, ReadForeign, InLibertyCell,
     "/* ", " */"},
    {"blif", nullptr, Wrapping::Always, WriteFile<WriteBlif>, ReadFile<ReadBlif>, nullptr, "# ",
     ""},
    {"pla", nullptr, Wrapping::Always, WriteTable, ReadFile<ReadPla>, nullptr, "# ", ""},
    {"eqn", EqnNotation, Wrapping::Always, WriteFile<WriteEqn>, ReadFile<ReadEqn>, nullptr,
     kNoComments, ""},
};

} // namespace

const std::vector<Target>& Targets()
{
    static const std::vector<Target> targets(std::begin(kTargets), std::end(kTargets));
    return targets;
}

const Target* FindTarget(const std::string& name)
{
    for (const Target& target : Targets())
        if (name == target.name)
            return &target;
    return nullptr;
}

const Target& TargetOf(const Notation& notation)
{
    const auto found =
        std::find_if(Targets().begin(), Targets().end(), [&notation](const Target& target) {
            return target.notation && &target.notation() == &notation;
        });
    assert(found != Targets().end());
    return *found;
}

std::vector<std::string> TargetNames()
{
    std::vector<std::string> names;
    for (const Target& target : Targets())
        names.push_back(target.name);
    return names;
}

} // namespace booleq
