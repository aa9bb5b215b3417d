// Netlists for the public header: designs of the rooms, made into plain values.
#include <algorithm>
#include <cassert>

#include <kq_logic/netlist.h>

#include "cause_text.h"
#include "comparison.h"
#include "fold.h"
#include "read_design.h"

namespace kq_logic {

struct Netlist::Imp {
    booleq::Design design;
};

struct NetlistAccess {
    static const booleq::Design& Of(const Netlist& netlist) { return netlist.m_imp->design; }
};

namespace {

// Fails: false with 'fault', for a file of cell types that cannot be read.
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

TableDifference ToPublic(const booleq::Comparison& comparison, const booleq::Design& left,
                         const booleq::Design& right, const booleq::TablePair& pair)
{
    const booleq::Difference own = comparison.Describe(pair);
    TableDifference difference;
    difference.path = Path(left, left.tables[pair.left].name);
    difference.rightPath = Path(right, right.tables[pair.right].name);
    difference.assignment = own.assignment;
    difference.left = own.left;
    difference.right = own.right;
    difference.shouldBe = own.expectedInit;
    for (const booleq::Cause& cause : own.causes)
        difference.causes.emplace_back(CauseWord(cause.code), CauseText(comparison, cause));
    return difference;
}

// The paths of tables that are on one side only; 'isSame' is false if one of them must not be.
std::vector<std::string> LonePaths(const booleq::Design& design,
                                   const std::vector<uint32_t>& tables, bool allowsWires,
                                   bool& isSame)
{
    std::vector<std::string> paths;
    for (const uint32_t table : tables) {
        paths.push_back(Path(design, design.tables[table].name));
        isSame = isSame && allowsWires && IsWire(design, table);
    }
    return paths;
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
    auto imp = std::make_shared<Imp>();
    if (!OptionsOf(options, cellTypes, own, fault) ||
        !booleq::ReadDesign(file, own, imp->design, fault))
        return false;
    m_imp = std::move(imp);
    return true;
}

bool Netlist::ReadText(const std::string& text, std::string& fault, const NetlistOptions& options)
{
    booleq::CellTypes cellTypes;
    booleq::ReadOptions own;
    auto imp = std::make_shared<Imp>();
    if (!OptionsOf(options, cellTypes, own, fault) ||
        !booleq::ReadDesignText(text, "text", own, imp->design, fault))
        return false;
    m_imp = std::move(imp);
    return true;
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
    plain.path = Path(design, own.name);
    plain.type = design.names.Text(design.types[own.type].name);
    plain.output = NetName(design, own.output);
    for (unsigned int pin = design.NumInputs(own); pin-- > 0;)
        plain.inputs.push_back(NetName(design, design.Inputs(own)[pin]));
    plain.init = booleq::HexOf(TableRows(design, design.inits[own.init]));
    return plain;
}

NetlistComparison Compare(const Netlist& left, const Netlist& right, const CompareOptions& options)
{
    booleq::Design leftDesign = NetlistAccess::Of(left);
    booleq::Design rightDesign = NetlistAccess::Of(right);
    booleq::CompareOptions own;
    own.renames = options.renames;
    own.followsWires = options.allowsWires;
    const booleq::Comparison comparison(leftDesign, rightDesign, own);
    NetlistComparison result;
    result.numSame = comparison.NumSame();
    result.isSame = comparison.Different().empty() && comparison.NumRenamed() == 0;
    for (const booleq::TablePair& pair : comparison.Different())
        result.differences.push_back(ToPublic(comparison, leftDesign, rightDesign, pair));
    result.missing =
        LonePaths(leftDesign, comparison.Pairs().onlyLeft, options.allowsWires, result.isSame);
    result.added =
        LonePaths(rightDesign, comparison.Pairs().onlyRight, options.allowsWires, result.isSame);
    for (const booleq::RenamedNet& net : comparison.RenamedNets())
        result.renamed.emplace_back(NetName(leftDesign, net.left), NetName(rightDesign, net.right));
    return result;
}

} // namespace kq_logic
