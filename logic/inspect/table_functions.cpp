#include "table_functions.h"

#include <algorithm>
#include <cassert>

#include "fold.h"

namespace booleq {

namespace {

// Whether folding leaves the table as it is: all pins are wires, and all are different.
bool IsPlain(const NetId* nets, unsigned int numNets)
{
    for (unsigned int place = 0; place < numNets; ++place) {
        if (nets[place] < kNumFixedNets)
            return false;
        for (unsigned int other = 0; other < place; ++other)
            if (nets[other] == nets[place])
                return false;
    }
    return true;
}

} // namespace

TableFunctions::TableFunctions(const Design& design)
    : m_design(design), m_inits(design.inits.size())
{
}

uint32_t TableFunctions::Number(const Rows& rows)
{
    const auto next = static_cast<uint32_t>(m_functions.size());
    const bool isWord = rows.NumInputs() <= kMaxWordInputs;
    const uint32_t number =
        isWord ? m_words[rows.NumInputs()].emplace(rows.Words()[0], next).first->second
               : m_wide.emplace(rows, next).first->second;
    if (number == next)
        m_functions.push_back(rows);
    assert(m_functions[number] == rows);
    return number;
}

TableFunctions::Folded TableFunctions::Fold(const Rows& rows)
{
    const std::vector<unsigned int> support = Support(rows);
    Folded folded;
    folded.function = Number(Restrict(rows, support));
    for (const unsigned int input : support)
        folded.support |= uint32_t(1) << input;
    return folded;
}

void TableFunctions::Find(const DesignTable& table, Found& found)
{
    const unsigned int numPins = m_design.NumInputs(table);
    const NetId* const pins = m_design.Inputs(table);
    found.nets.clear();
    found.idle.clear();
    Folded folded;
    const auto sort = [&](unsigned int input, NetId net) {
        ((folded.support >> input & 1u) != 0 ? found.nets : found.idle).push_back(net);
    };
    if (IsPlain(pins, numPins)) {
        Folded& known = m_inits[table.init];
        if (known.function == UINT32_MAX)
            known = Fold(TableRows(m_design, m_design.inits[table.init]));
        folded = known;
        for (unsigned int input = 0; input < numPins; ++input)
            sort(input, pins[numPins - 1 - input]);
    } else {
        const FoldedRows rows = FoldTable(m_design, table);
        folded = Fold(rows.rows);
        for (unsigned int input = 0; input < rows.nets.size(); ++input)
            sort(input, rows.nets[input]);
    }
    found.function = folded.function;
    assert(found.nets.size() == m_functions[found.function].NumInputs());
}

} // namespace booleq
