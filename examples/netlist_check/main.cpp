// Checks a netlist of look-up tables against the equations that it was made from.
// usage: netlist_check NETLIST.blif EQUATIONS
// Prints each look-up table with its init value and expression, then each output's verdict.
// Exit status: 0 all agree, 1 something differs, 2 a file cannot be read or is wrong.
#include <algorithm>
#include <cstdio>
#include <exception>

#include "blif.h"
#include "equations.h"

namespace {

// Every assignment is tried, so their number is limited.
constexpr size_t kMaxInputs = 24;

std::string Joined(const std::vector<std::string>& names)
{
    std::string text;
    for (const std::string& name : names)
        text += (text.empty() ? "" : " ") + name;
    return text;
}

// Prints the table. False when its expression, read back, is another function.
bool CheckTable(const Table& table)
{
    const bool isConstant = table.inputs.empty();
    const KqString init = table.inputs.size() == 1
                              ? table.equation.GetEquationAsBinaryInitValue()
                              : table.equation.GetEquationAsHexInitValue(false);
    const std::string expression = table.equation.GetEquationAsExpression(false).c_str();
    std::printf("lut %s\n  inputs      %s\n  init        %s\n  expression  %s\n",
                table.output.c_str(), isConstant ? "none" : Joined(table.inputs).c_str(),
                isConstant ? "none" : init.c_str(), expression.c_str());

    Kq_BoolEquation again;
    std::vector<KqString> inputs;
    for (const std::string& input : table.inputs)
        inputs.emplace_back(input.c_str());
    std::vector<uint64_t> column;
    if (again.SetEquationWithExplicitTerms(inputs, expression.c_str(), false, false) &&
        again.GetColumn(column) && column == table.column)
        return true;
    std::printf("  DIFFERS: the expression, read again, is another function\n");
    return false;
}

// Inputs that either side needs, in the netlist's order.
std::vector<std::string> CommonInputs(const Network& network, const Evaluator& first,
                                      const Evaluator& second)
{
    std::vector<std::string> common;
    for (const std::string& input : network.inputs)
        for (const Evaluator* side : {&first, &second}) {
            const std::vector<std::string>& needed = side->GetInputs();
            if (std::find(needed.begin(), needed.end(), input) == needed.end())
                continue;
            common.push_back(input);
            break;
        }
    return common;
}

// Compares one output for every assignment and prints the verdict.
bool CheckOutput(const Network& network, const Network& equations, const std::string& output)
{
    const auto& defined = equations.outputs;
    if (std::find(defined.begin(), defined.end(), output) == defined.end()) {
        std::printf("output %s: NOT CHECKED, %s does not define it\n", output.c_str(),
                    equations.file.c_str());
        return false;
    }
    Evaluator mapped(network, output);
    Evaluator meant(equations, output);
    const std::vector<std::string> inputs = CommonInputs(network, mapped, meant);
    if (inputs.size() > kMaxInputs)
        throw Fault(network.file + ": " + output + " depends on " + std::to_string(inputs.size()) +
                    " inputs, more than " + std::to_string(kMaxInputs) + "; cut the design");

    const size_t numRows = size_t{1} << inputs.size();
    std::map<std::string, bool> values;
    for (size_t row = 0; row < numRows; ++row) {
        for (size_t place = 0; place < inputs.size(); ++place)
            values[inputs[place]] = (row >> (inputs.size() - 1 - place) & 1) != 0;
        const bool isMapped = mapped.Evaluate(values);
        if (isMapped == meant.Evaluate(values))
            continue;
        std::printf("output %s: DIFFERS, the equation is %d and the netlist %d at", output.c_str(),
                    isMapped ? 0 : 1, isMapped ? 1 : 0);
        for (const std::string& input : inputs)
            std::printf(" %s=%d", input.c_str(), values[input] ? 1 : 0);
        std::printf("\n");
        return false;
    }
    std::printf("output %s: agrees, %zu assignments of %zu inputs\n", output.c_str(), numRows,
                inputs.size());
    return true;
}

bool Check(const std::string& netlistFile, const std::string& equationFile)
{
    const Network network = ReadBlif(netlistFile);
    const Network equations = ReadEquations(equationFile, network.inputs);
    size_t numWrong = 0;
    for (const Table& table : network.tables)
        numWrong += CheckTable(table) ? 0u : 1u;
    for (const std::string& output : network.outputs)
        numWrong += CheckOutput(network, equations, output) ? 0u : 1u;
    std::printf("%zu look-up tables, %zu outputs, %zu wrong\n", network.tables.size(),
                network.outputs.size(), numWrong);
    return numWrong == 0;
}

} // namespace

int main(int argc, char** argv)
{
    if (argc != 3) {
        std::fprintf(stderr, "usage: netlist_check NETLIST.blif EQUATIONS\n");
        return 2;
    }
    try {
        return Check(argv[1], argv[2]) ? 0 : 1;
    } catch (const std::exception& fault) {
        std::fprintf(stderr, "netlist_check: %s\n", fault.what());
        return 2;
    }
}
