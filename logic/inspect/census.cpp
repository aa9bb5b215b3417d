#include "census.h"

#include <algorithm>
#include <cassert>
#include <map>
#include <unordered_map>

#include "canonical.h"
#include "table_functions.h"
#include "watch.h"

namespace booleq {

namespace {

constexpr uint64_t kWatchedTables = 4096;

void Count(std::vector<uint64_t>& counts, size_t place)
{
    if (counts.size() <= place)
        counts.resize(place + 1, 0);
    ++counts[place];
}

void CountKind(const Rows& rows, Census& census)
{
    if (rows.NumInputs() == 0)
        ++census.numConstant;
    else if (rows.NumInputs() == 1)
        ++(rows.At(1) ? census.numWires : census.numInverters);
}

void CountTables(const Design& design, TableFunctions& functions, Census& census)
{
    TableFunctions::Found found;
    for (const DesignTable& table : design.tables) {
        if (census.numTables++ % kWatchedTables == 0)
            Watch();
        functions.Find(table, found);
        if (found.function == census.functions.size())
            census.functions.push_back({functions.Functions()[found.function], 0, 0});
        ++census.functions[found.function].numTables;
        Count(census.byWidth, design.NumInputs(table));
        Count(census.byInputs, found.nets.size());
        CountKind(functions.Functions()[found.function], census);
        census.numIdle += found.idle.empty() ? 0 : 1;
    }
}

void NumberClasses(Census& census)
{
    std::unordered_map<uint64_t, uint32_t> numbers[kMaxWordInputs + 1];
    for (CountedFunction& function : census.functions) {
        const unsigned int numInputs = function.rows.NumInputs();
        if (numInputs > kMaxWordInputs) {
            ++census.numWide;
            continue;
        }
        const uint64_t form =
            FindCanonical(function.rows.Words()[0], numInputs, CanonicalScope::OrderAndInversions)
                .form;
        const auto added = numbers[numInputs].emplace(form, census.numClasses);
        function.classNumber = added.first->second;
        census.numClasses += added.second ? 1 : 0;
    }
}

void CountTypes(const Design& design, Census& census)
{
    for (const DesignType& type : design.types)
        if (type.numCells > 0)
            census.types.push_back(
                {std::string(design.names.Text(type.name)), type.role, type.numCells, type.note});
    std::sort(census.types.begin(), census.types.end(),
              [](const TypeCount& left, const TypeCount& right) {
                  return left.numCells != right.numCells ? left.numCells > right.numCells
                                                         : left.name < right.name;
              });
}

void CountFindings(const Design& design, Census& census)
{
    std::map<FindingCode, uint64_t> counts;
    for (const ReadFinding& finding : design.findings)
        ++counts[finding.code];
    census.findings.assign(counts.begin(), counts.end());
}

} // namespace

const char* RoleWord(CellRole role)
{
    switch (role) {
    case CellRole::Table:
        return "table";
    case CellRole::Constant:
        return "constant";
    case CellRole::Unread:
        return "not read";
    case CellRole::Module:
        return "module";
    case CellRole::Other:
        break;
    }
    return "other";
}

Census TakeCensus(const Design& design)
{
    Census census;
    TableFunctions functions(design);
    CountTables(design, functions, census);
    NumberClasses(census);
    std::sort(census.functions.begin(), census.functions.end(),
              [](const CountedFunction& left, const CountedFunction& right) {
                  return left.numTables != right.numTables ? left.numTables > right.numTables
                                                           : left.rows < right.rows;
              });
    CountTypes(design, census);
    CountFindings(design, census);
    census.numCells = design.numCells;
    census.numUnread = design.unread.size();
    assert(census.numTables == design.tables.size());
    return census;
}

} // namespace booleq
