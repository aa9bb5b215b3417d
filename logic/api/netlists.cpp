// Netlists for the public header: designs of the rooms, turned into plain values.
#include <algorithm>
#include <cassert>

#include <kq_logic/netlist_compare.h>

#include "cause_text.h"
#include "census.h"
#include "comparison.h"
#include "equation_text.h"
#include "fold.h"
#include "net_equations.h"
#include "read_design.h"
#include "table_findings.h"

namespace kq_logic {

struct Netlist::Imp {
    booleq::Design design;
    std::vector<std::string> types; // names of the design's types
};

struct NetlistAccess {
    static const booleq::Design& Of(const Netlist& netlist) { return netlist.m_imp->design; }
};

namespace {

// Fails: false with 'fault', if a file of cell types cannot be read.
bool OptionsOf(const NetlistOptions& options, booleq::CellTypes& cellTypes,
               booleq::ReadOptions& own, std::string& fault)
{
    cellTypes = booleq::CellTypes::Known();
    if (!options.cellsFile.empty() && !cellTypes.AddFile(options.cellsFile, fault))
        return false;
    own.cellTypes = &cellTypes;
    own.keyAttribute = options.key;
    own.top = options.top;
    return true;
}

TableDifference ToPublic(const booleq::Comparison& comparison, booleq::NetEquations& equations,
                         const booleq::TablePair& pair)
{
    const booleq::Design& left = comparison.Left();
    const booleq::Difference own = comparison.Describe(pair);
    TableDifference difference;
    difference.path = TableName(left, pair.left);
    difference.rightPath = TableName(comparison.Right(), pair.right);
    difference.matchedBy = PairedWord(pair.by);
    difference.output = NetName(left, left.tables[pair.left].output);
    difference.assignment = own.assignment;
    difference.isSameFunction = own.isSameFunction;
    difference.left = own.left;
    difference.right = own.right;
    difference.leftEquation = equations.Of(own.leftFunction);
    difference.rightEquation = equations.Of(own.rightFunction);
    difference.shouldBe = own.expectedInit;
    for (const booleq::Cause& cause : own.causes)
        difference.causes.emplace_back(CauseWord(cause.code), CauseText(comparison, cause));
    return difference;
}

std::vector<LoneTable> LoneTables(const booleq::Design& design, const std::vector<uint32_t>& tables)
{
    std::vector<LoneTable> lone;
    lone.reserve(tables.size());
    for (const uint32_t table : tables)
        lone.push_back({TableName(design, table), NetName(design, design.tables[table].output),
                        WireText(design, table)});
    return lone;
}

booleq::CompareOptions OptionsOf(const CompareOptions& options)
{
    booleq::CompareOptions own;
    own.renames = options.renames;
    own.followsWires = options.allowsWires;
    switch (options.names) {
    case NetlistNames::Auto:
        own.names = booleq::NetNames::Auto;
        break;
    case NetlistNames::Kept:
        own.names = booleq::NetNames::Kept;
        break;
    case NetlistNames::Gone:
        own.names = booleq::NetNames::Gone;
        break;
    }
    if (options.openInputs >= 0)
        own.openInputs = options.openInputs == 0 ? booleq::kNetZero : booleq::kNetOne;
    return own;
}

NetlistFunctionCount ToPublic(const booleq::CountedFunction& counted)
{
    const booleq::NamedFunction named = NameFunction(counted.rows);
    NetlistFunctionCount count;
    const uint64_t* const words = counted.rows.Words();
    const bool isSet =
        count.function.Set(booleq::Letters(counted.rows.NumInputs()),
                           std::vector<uint64_t>(words, words + counted.rows.Size()));
    assert(isSet);
    static_cast<void>(isSet);
    count.kind = named.kind;
    count.meaning = named.meaning;
    count.expression = named.equation;
    count.numTables = counted.numTables;
    return count;
}

// Stores a design that has been read, with the names of its types.
void Complete(booleq::Design design, Netlist::Imp& imp)
{
    imp.design = std::move(design);
    for (const booleq::DesignType& type : imp.design.types)
        imp.types.emplace_back(imp.design.names.Text(type.name));
}

} // namespace

Netlist::Netlist()
{
    auto imp = std::make_shared<Imp>();
    imp->design.nets.resize(booleq::kNumFixedNets);
    m_imp = std::move(imp);
}

bool Netlist::Read(const std::string& file, std::string& fault, const NetlistOptions& options)
{
    booleq::CellTypes cellTypes;
    booleq::ReadOptions own;
    booleq::Design design;
    if (!OptionsOf(options, cellTypes, own, fault) || !booleq::ReadDesign(file, own, design, fault))
        return false;
    const auto imp = std::make_shared<Imp>();
    Complete(std::move(design), *imp);
    m_imp = imp;
    return true;
}

bool Netlist::ReadText(const std::string& text, std::string& fault, const NetlistOptions& options)
{
    booleq::CellTypes cellTypes;
    booleq::ReadOptions own;
    booleq::Design design;
    if (!OptionsOf(options, cellTypes, own, fault) ||
        !booleq::ReadDesignText(text, "text", own, design, fault))
        return false;
    const auto imp = std::make_shared<Imp>();
    Complete(std::move(design), *imp);
    m_imp = imp;
    return true;
}

std::string Netlist::Format() const
{
    return m_imp->design.format;
}

std::string Netlist::Top() const
{
    return std::string(m_imp->design.names.Text(m_imp->design.top));
}

size_t Netlist::NumTables() const
{
    return m_imp->design.tables.size();
}

NetlistTable Netlist::At(size_t table) const
{
    const booleq::Design& design = m_imp->design;
    assert(table < design.tables.size());
    const booleq::DesignTable& own = design.tables[table];
    NetlistTable plain;
    plain.path = PathAt(table);
    plain.type = m_imp->types[own.type];
    plain.output = NetName(design, own.output);
    for (unsigned int pin = design.NumInputs(own); pin-- > 0;)
        plain.inputs.push_back(NetName(design, design.Inputs(own)[pin]));
    plain.init = booleq::HexOf(TableRows(design, design.inits[own.init]));
    plain.key = KeyAt(table);
    plain.line = own.line;
    return plain;
}

std::vector<unsigned int> Netlist::Widths() const
{
    const booleq::Design& design = m_imp->design;
    std::vector<bool> isThere(booleq::kMaxTableInputs + 1, false);
    for (const booleq::DesignTable& table : design.tables)
        isThere[design.NumInputs(table)] = true;
    std::vector<unsigned int> widths;
    for (unsigned int width = 0; width < isThere.size(); ++width)
        if (isThere[width])
            widths.push_back(width);
    return widths;
}

NetlistArrays Netlist::Arrays(unsigned int width) const
{
    const booleq::Design& design = m_imp->design;
    NetlistArrays arrays;
    for (uint32_t table = 0; table < design.tables.size(); ++table) {
        const booleq::DesignTable& own = design.tables[table];
        const booleq::InitValue& init = design.inits[own.init];
        if (init.numInputs != width)
            continue;
        const uint64_t* const words = design.Words(init);
        arrays.tables.push_back(table);
        arrays.words.insert(arrays.words.end(), words, words + booleq::NumWords(width));
        for (unsigned int pin = width; pin-- > 0;)
            arrays.inputs.push_back(design.Inputs(own)[pin]);
        arrays.outputs.push_back(own.output);
        arrays.types.push_back(own.type);
        arrays.lines.push_back(own.line);
    }
    return arrays;
}

std::string Netlist::PathAt(size_t table) const
{
    assert(table < NumTables());
    return TableName(m_imp->design, static_cast<uint32_t>(table));
}

std::string Netlist::KeyAt(size_t table) const
{
    const booleq::Design& design = m_imp->design;
    assert(table < NumTables());
    return design.keys.empty() ? std::string() : std::string(design.names.Text(design.keys[table]));
}

size_t Netlist::NumNets() const
{
    return m_imp->design.nets.size();
}

std::string Netlist::NetAt(size_t net) const
{
    assert(net < NumNets());
    return NetName(m_imp->design, static_cast<booleq::NetId>(net));
}

const std::vector<std::string>& Netlist::Types() const
{
    return m_imp->types;
}

NetlistStats Netlist::Stats() const
{
    const booleq::Design& design = m_imp->design;
    const booleq::Census census = TakeCensus(design);
    NetlistStats stats;
    stats.numCells = census.numCells;
    stats.numTables = census.numTables;
    stats.byPins = census.byWidth;
    stats.byInputs = census.byInputs;
    stats.numFunctions = census.functions.size();
    stats.numClasses = census.numClasses;
    stats.numWide = census.numWide;
    stats.numConstant = census.numConstant;
    stats.numWires = census.numWires;
    stats.numInverters = census.numInverters;
    stats.numIdle = census.numIdle;
    stats.numUnread = census.numUnread;
    for (const auto& finding : census.findings)
        stats.findings.emplace_back(CodeWord(finding.first), finding.second);
    for (const booleq::TypeCount& type : census.types)
        stats.types.push_back({type.name, RoleWord(type.role), type.note, type.numCells});
    for (const booleq::CountedFunction& function : census.functions)
        if (stats.commonest.size() < booleq::kMaxCommonest)
            stats.commonest.push_back(ToPublic(function));
    return stats;
}

uint64_t Netlist::Check(const std::function<bool(const NetlistFinding&)>& take) const
{
    return FindFindings(m_imp->design, [&take](const booleq::TableFinding& finding) {
        const booleq::FindingRule& rule = booleq::FindingRules()[finding.rule];
        return take(
            {rule.word, SeverityWord(rule.severity), finding.path, finding.text, finding.line});
    });
}

NetlistComparison Compare(const Netlist& left, const Netlist& right, const CompareOptions& options)
{
    booleq::Design leftDesign = NetlistAccess::Of(left);
    booleq::Design rightDesign = NetlistAccess::Of(right);
    const booleq::Comparison comparison(leftDesign, rightDesign, OptionsOf(options));
    booleq::NetEquations equations(comparison);
    const booleq::Pairing& pairing = comparison.Pairs();
    NetlistComparison result;
    result.isSame = comparison.IsSame();
    result.numSame = comparison.NumSame();
    result.numRenamed = comparison.NumRenamed();
    result.numDifferent = comparison.Different().size();
    for (const booleq::TablePair& pair : comparison.Different())
        if (result.differences.size() < options.maxDescribed)
            result.differences.push_back(ToPublic(comparison, equations, pair));
    result.missing = LoneTables(leftDesign, pairing.onlyLeft);
    result.added = LoneTables(rightDesign, pairing.onlyRight);
    for (const booleq::RenamedNet& net : comparison.RenamedNets())
        result.renamed.push_back(
            {NetName(leftDesign, net.left), NetName(rightDesign, net.right), net.numTables});
    result.areNamesGone = comparison.AreNamesGone();
    result.numMatchedNets = comparison.Nets().NumKnown();
    result.numByOrder = comparison.NumByOrder();
    result.numKeysTwice = pairing.numKeysTwice;
    result.unusedRenames = comparison.UnusedRenames();
    return result;
}

} // namespace kq_logic
