#include "design_check.h"

#include <algorithm>
#include <cinttypes>
#include <cstdio>
#include <unordered_map>

#include "fold.h"

namespace tests {

using namespace booleq;

namespace {

std::string HexOf(const Rows& rows)
{
    std::string text;
    for (size_t word = rows.Size(); word-- > 0;) {
        char digits[20];
        std::snprintf(digits, sizeof digits, word + 1 == rows.Size() ? "%" PRIx64 : "%016" PRIx64,
                      rows.Words()[word]);
        text += digits;
    }
    return text;
}

bool IsName(const Design& design, const ScopedName& name)
{
    return name.scope < design.scopes.size() && name.name < design.names.Size();
}

std::string BrokenTable(const Design& design, const DesignTable& table)
{
    if (!IsName(design, table.name) || Path(design, table.name).empty())
        return "a table without a name";
    if (table.type >= design.types.size())
        return "a table without a type";
    if (design.types[table.type].role != CellRole::Table)
        return "a table of a type that has none";
    if (table.init >= design.inits.size())
        return "a table without an init value";
    if (table.output >= design.nets.size())
        return "a table without an output";
    if (table.firstInput + size_t(design.NumInputs(table)) > design.inputs.size())
        return "a table without inputs";
    for (unsigned int pin = 0; pin < design.NumInputs(table); ++pin)
        if (design.Inputs(table)[pin] >= design.nets.size())
            return "an input without a net";
    if (FoldTable(design, table).nets.size() > design.NumInputs(table))
        return "a folded table with more inputs";
    return "";
}

std::string BrokenInit(const Design& design, const InitValue& init)
{
    const size_t numWords = NumWords(init.numInputs);
    if (init.numInputs > kMaxTableInputs ||
        init.firstWord + numWords * (init.hasUnknown ? 2 : 1) > design.words.size())
        return "an init value without words";
    for (size_t word = 0; word < numWords * (init.hasUnknown ? 2 : 1); ++word)
        if ((design.Words(init)[word] & ~RowMask(init.numInputs)) != 0)
            return "an init value with bits beyond its rows";
    for (size_t word = 0; init.hasUnknown && word < numWords; ++word)
        if ((design.Words(init)[word] & design.Words(init)[numWords + word]) != 0)
            return "an unknown bit that is 1";
    return "";
}

// The name that the reference shows for each net that shares a name with one of its nets.
std::vector<std::string> ReferenceNames(const Design& design, const Design& reference)
{
    std::unordered_map<std::string, std::string> shown;
    for (NetId net = kNumFixedNets; net < reference.nets.size(); ++net)
        shown[Path(reference, reference.nets[net])] = NetName(reference, net);
    for (const auto& alias : reference.aliases)
        shown.emplace(Path(reference, alias.second), NetName(reference, alias.first));
    std::vector<std::string> names;
    for (NetId net = 0; net < design.nets.size(); ++net)
        names.push_back(NetName(design, net));
    std::vector<bool> isFound(names.size(), false);
    const auto take = [&](NetId net, const std::string& name) {
        const auto found = shown.find(name);
        if (net < kNumFixedNets || isFound[net] || found == shown.end())
            return;
        names[net] = found->second;
        isFound[net] = true;
    };
    for (NetId net = kNumFixedNets; net < design.nets.size(); ++net)
        take(net, Path(design, design.nets[net]));
    for (const auto& alias : design.aliases)
        take(alias.first, Path(design, alias.second));
    return names;
}

std::string FunctionLine(const FoldedRows& folded, const std::vector<std::string>& names,
                         const std::string& output)
{
    std::vector<unsigned int> support = Support(folded.rows);
    const Rows small = Restrict(folded.rows, support);
    std::vector<unsigned int> order(support.size());
    for (unsigned int input = 0; input < order.size(); ++input)
        order[input] = input;
    const auto nameOf = [&](unsigned int input) -> const std::string& {
        return names[folded.nets[support[input]]];
    };
    std::sort(order.begin(), order.end(),
              [&](unsigned int left, unsigned int right) { return nameOf(left) < nameOf(right); });
    const std::string rows = HexOf(PermuteInputs(small, order));
    if (order.size() == 1 && rows == "2")
        return ""; // a wire
    std::string line = output + " = " + rows + "(";
    for (size_t place = 0; place < order.size(); ++place)
        line += (place == 0 ? "" : ", ") + nameOf(order[place]);
    return line + ")";
}

} // namespace

std::string BrokenInvariant(const Design& design)
{
    if (design.nets.size() < kNumFixedNets)
        return "the fixed nets are missing";
    for (ScopeId scope = 1; scope < design.scopes.size(); ++scope)
        if (design.scopes[scope].parent >= scope)
            return "a scope before its parent";
    for (const InitValue& init : design.inits) {
        const std::string broken = BrokenInit(design, init);
        if (!broken.empty())
            return broken;
    }
    for (const DesignTable& table : design.tables) {
        const std::string broken = BrokenTable(design, table);
        if (!broken.empty())
            return broken;
    }
    for (NetId net = kNumFixedNets; net < design.nets.size(); ++net)
        if (!IsName(design, design.nets[net]))
            return "a net without a name";
    for (const auto& alias : design.aliases)
        if (alias.first >= design.nets.size() || !IsName(design, alias.second))
            return "an alias without a net or a name";
    for (const DesignPort& port : design.ports)
        if (port.net >= design.nets.size() || port.name >= design.names.Size())
            return "a port without a net or a name";
    for (const ReadFinding& finding : design.findings)
        if ((finding.table != ReadFinding::kNoTable && finding.table >= design.tables.size()) ||
            !IsName(design, finding.name))
            return "a finding of nothing";
    return design.keys.empty() || design.keys.size() == design.tables.size()
               ? ""
               : "keys for some tables only";
}

std::string TableLine(const Design& design, const DesignTable& table)
{
    const DesignType& type = design.types[table.type];
    std::string line = Path(design, table.name) + " " + std::string(design.names.Text(type.name));
    if (type.outputPins.size() > 1)
        line += "." + type.outputPins[table.outputPin];
    line += ": " + NetName(design, table.output) + " = " +
            HexOf(TableRows(design, design.inits[table.init])) + "(";
    for (unsigned int pin = design.NumInputs(table); pin-- > 0;)
        line += NetName(design, design.Inputs(table)[pin]) + (pin == 0 ? "" : ", ");
    return line + ")";
}

std::vector<std::string> TableLines(const Design& design)
{
    std::vector<std::string> lines;
    for (const DesignTable& table : design.tables)
        lines.push_back(TableLine(design, table));
    return lines;
}

std::vector<std::string> FindingLines(const Design& design)
{
    std::vector<std::string> lines;
    for (const ReadFinding& finding : design.findings)
        lines.push_back(std::string(CodeWord(finding.code)) + " " + Path(design, finding.name) +
                        (finding.text.empty() ? "" : " " + finding.text));
    return lines;
}

NetId NetOf(const Design& design, const std::string& name)
{
    for (NetId net = kNumFixedNets; net < design.nets.size(); ++net)
        if (Path(design, design.nets[net]) == name)
            return net;
    for (const auto& alias : design.aliases)
        if (Path(design, alias.second) == name)
            return alias.first;
    return kNetOpen;
}

std::vector<std::string> FunctionLines(const Design& design, const Design& reference)
{
    const std::vector<std::string> names = ReferenceNames(design, reference);
    std::vector<std::string> lines;
    for (const DesignTable& table : design.tables) {
        const std::string line = FunctionLine(FoldTable(design, table), names, names[table.output]);
        if (!line.empty())
            lines.push_back(line);
    }
    std::sort(lines.begin(), lines.end());
    return lines;
}

} // namespace tests
