#include "equations.h"

#include <algorithm>
#include <fstream>

#include "../shared/refusal_words.h"

namespace {

constexpr char kBlanks[] = " \t\r";

std::string Trimmed(const std::string& text)
{
    const size_t start = text.find_first_not_of(kBlanks);
    return start == std::string::npos
               ? ""
               : text.substr(start, text.find_last_not_of(kBlanks) + 1 - start);
}

bool Contains(const std::vector<std::string>& names, const std::string& name)
{
    return std::find(names.begin(), names.end(), name) != names.end();
}

// The table of one definition. 'known' has the names that it may use.
Table ReadDefinition(const std::string& file, size_t lineNumber, const std::string& line,
                     const std::vector<std::string>& known)
{
    const size_t sign = line.find('=', line[0] == '\'' ? line.find('\'', 1) : 0);
    if (sign == std::string::npos)
        Fail(file, lineNumber, "there is no '='; write NAME = EQUATION");
    Table table;
    table.line = lineNumber;
    table.output = Trimmed(line.substr(0, sign));
    if (table.output.empty())
        Fail(file, lineNumber, "there is no name before '='; write NAME = EQUATION");
    if (Contains(known, table.output))
        Fail(file, lineNumber, table.output + " is an input or defined above already");

    const size_t start = std::min(line.find_first_not_of(kBlanks, sign + 1), line.size());
    const std::string text = Trimmed(line.substr(start));
    // Asked before the equation is set, because setting a wrong one dumps the node to blame.
    const Kq_BoolEquation::Refusal refusal = Kq_BoolEquation::FindRefusal(text.c_str());
    if (refusal.code != Kq_BoolEquation::Refusal::NONE)
        Fail(file + ":" + std::to_string(lineNumber), start + refusal.offset + 1,
             examples::Words(refusal, text.substr(refusal.offset, refusal.length)));
    table.equation.SetEquation(text.c_str());
    for (const auto& variable : table.equation.GetVariables()) {
        table.inputs.emplace_back(variable.first.c_str());
        if (!Contains(known, table.inputs.back()))
            Fail(file, lineNumber,
                 table.inputs.back() + " is neither an input of the netlist nor defined above");
    }
    if (!table.equation.GetColumn(table.column))
        Fail(file, lineNumber,
             "the equation has more than 30 inputs; define a part of it on a line of its own");
    return table;
}

} // namespace

Network ReadEquations(const std::string& path, const std::vector<std::string>& inputs)
{
    std::ifstream stream(path);
    if (!stream)
        throw Fault(path + ": cannot be read");
    Network network;
    network.file = path;
    network.inputs = inputs;
    std::vector<std::string> known = inputs;
    std::string line;
    for (size_t number = 1; std::getline(stream, line); ++number) {
        const size_t start = line.find_first_not_of(kBlanks);
        if (start == std::string::npos || line[start] == '#')
            continue;
        network.tables.push_back(ReadDefinition(path, number, line, known));
        known.push_back(network.tables.back().output);
        network.outputs.push_back(known.back());
    }
    return network;
}
