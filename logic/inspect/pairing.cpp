#include "pairing.h"

#include <algorithm>
#include <cassert>
#include <string_view>
#include <unordered_map>
#include <unordered_set>

namespace booleq {

namespace {

// Outputs of a cell are distinguished by their pins. If both cells have only one output, the names
// of the pins do not matter.
bool IsSameOutput(const Design& left, const DesignTable& leftTable, const Design& right,
                  const DesignTable& rightTable)
{
    const std::vector<std::string>& leftPins = left.types[leftTable.type].outputPins;
    const std::vector<std::string>& rightPins = right.types[rightTable.type].outputPins;
    if (leftPins.size() <= 1 && rightPins.size() <= 1)
        return true;
    return leftTable.outputPin < leftPins.size() && rightTable.outputPin < rightPins.size() &&
           leftPins[leftTable.outputPin] == rightPins[rightTable.outputPin];
}

class Pairer {
  public:
    Pairer(const Design& left, const Design& right, const NameMatch& match, const NetMap& nets)
        : m_left(left), m_right(right), m_match(match), m_nets(nets),
          m_partners(left.tables.size(), kNotThere), m_by(left.tables.size(), PairedBy::Path),
          m_is_taken(right.tables.size(), false)
    {
    }

    Pairing Run(PairWays ways)
    {
        if (ways == PairWays::All) {
            PairByPath(false);
            PairByNet();
            PairByPath(true);
        }
        PairByKey();
        return TakeAll();
    }

  private:
    bool Pair(uint32_t leftTable, uint32_t rightTable, PairedBy by)
    {
        if (m_partners[leftTable] != kNotThere || m_is_taken[rightTable] ||
            !IsSameOutput(m_left, m_left.tables[leftTable], m_right, m_right.tables[rightTable]))
            return false;
        m_partners[leftTable] = rightTable;
        m_by[leftTable] = by;
        m_is_taken[rightTable] = true;
        return true;
    }

    bool HasMadeUpName(const DesignTable& table) const
    {
        const std::string_view name = m_left.names.Text(table.name.name);
        return !name.empty() && name.front() == '$';
    }

    // The outputs of a cell are consecutive, so the first one leads to all of them.
    void PairByPath(bool isMadeUp)
    {
        ScopedIndex index(m_right);
        for (uint32_t table = 0; table < m_right.tables.size(); ++table)
            if (!m_right.tables[table].isNamedByOutput)
                index.Add(m_right.tables[table].name, table);
        for (uint32_t table = 0; table < m_left.tables.size(); ++table) {
            const DesignTable& own = m_left.tables[table];
            if (m_partners[table] != kNotThere || own.isNamedByOutput ||
                HasMadeUpName(own) != isMadeUp)
                continue;
            uint32_t other = m_match.Find(own.name, index);
            if (other == kNotThere)
                continue;
            const ScopedName name = m_right.tables[other].name;
            for (;
                 other < m_right.tables.size() && m_right.tables[other].name.scope == name.scope &&
                 m_right.tables[other].name.name == name.name;
                 ++other)
                if (Pair(table, other, PairedBy::Path))
                    break;
        }
    }

    void PairByNet()
    {
        std::vector<uint32_t> drivers(m_right.nets.size(), kNotThere);
        for (uint32_t table = 0; table < m_right.tables.size(); ++table) {
            const NetId net = m_right.tables[table].output;
            if (net >= kNumFixedNets && drivers[net] == kNotThere)
                drivers[net] = table;
        }
        for (uint32_t table = 0; table < m_left.tables.size(); ++table) {
            const NetId net = m_left.tables[table].output;
            if (m_partners[table] != kNotThere || net < kNumFixedNets || !m_nets.IsKnownLeft(net))
                continue;
            const uint32_t driver = drivers[m_nets.RightOfLeft(net)];
            if (driver == kNotThere || m_is_taken[driver])
                continue;
            m_partners[table] = driver; // whatever the pins are called
            m_by[table] = PairedBy::Net;
            m_is_taken[driver] = true;
        }
    }

    void PairByKey()
    {
        if (m_left.keys.empty() || m_right.keys.empty())
            return;
        std::vector<uint32_t> firsts(m_right.names.Size(), kNotThere);
        for (uint32_t table = 0; table < m_right.tables.size(); ++table) {
            const NameId key = m_right.keys[table];
            if (key == 0)
                continue;
            if (firsts[key] == kNotThere)
                firsts[key] = table;
            else if (!IsOneCell(m_right, firsts[key], table))
                ++m_num_keys_twice;
        }
        for (uint32_t table = 0; table < m_left.tables.size(); ++table) {
            const NameId key =
                m_left.keys[table] == 0 ? kNotThere : m_match.Find(m_left.keys[table]);
            if (m_partners[table] != kNotThere || key == kNotThere || firsts[key] == kNotThere)
                continue;
            for (uint32_t other = firsts[key];
                 other < m_right.tables.size() && IsOneCell(m_right, firsts[key], other); ++other)
                if (Pair(table, other, PairedBy::Key))
                    break;
        }
    }

    static bool IsOneCell(const Design& design, uint32_t first, uint32_t second)
    {
        const ScopedName& one = design.tables[first].name;
        const ScopedName& other = design.tables[second].name;
        return one.scope == other.scope && one.name == other.name;
    }

    Pairing TakeAll()
    {
        Pairing pairing;
        pairing.numKeysTwice = m_num_keys_twice;
        for (uint32_t table = 0; table < m_left.tables.size(); ++table) {
            if (m_partners[table] == kNotThere)
                pairing.onlyLeft.push_back(table);
            else
                pairing.pairs.push_back({table, m_partners[table], m_by[table]});
        }
        for (uint32_t table = 0; table < m_right.tables.size(); ++table)
            if (!m_is_taken[table])
                pairing.onlyRight.push_back(table);
        assert(pairing.pairs.size() + pairing.onlyLeft.size() == m_left.tables.size());
        assert(pairing.pairs.size() + pairing.onlyRight.size() == m_right.tables.size());
        return pairing;
    }

    const Design& m_left;
    const Design& m_right;
    const NameMatch& m_match;
    const NetMap& m_nets;
    std::vector<uint32_t> m_partners; // of each left table
    std::vector<PairedBy> m_by;
    std::vector<bool> m_is_taken; // of each right table
    uint64_t m_num_keys_twice = 0;
};

} // namespace

Pairing PairTables(const Design& left, const Design& right, const NameMatch& match,
                   const NetMap& nets, PairWays ways)
{
    return Pairer(left, right, match, nets).Run(ways);
}

size_t PairRest(const Design& left, const Design& right, const NetMap& nets, Pairing& pairing)
{
    std::unordered_map<NetId, uint32_t> drivers;
    for (const uint32_t table : pairing.onlyRight)
        if (right.tables[table].output >= kNumFixedNets)
            drivers.emplace(right.tables[table].output, table);
    std::vector<uint32_t> rest;
    std::unordered_set<uint32_t> taken;
    for (const uint32_t table : pairing.onlyLeft) {
        const NetId output = left.tables[table].output;
        const auto driver = output >= kNumFixedNets && nets.IsKnownLeft(output)
                                ? drivers.find(nets.RightOfLeft(output))
                                : drivers.end();
        if (driver == drivers.end() || !taken.insert(driver->second).second)
            rest.push_back(table);
        else
            pairing.pairs.push_back({table, driver->second, PairedBy::Net});
    }
    pairing.onlyLeft = std::move(rest);
    pairing.onlyRight.erase(
        std::remove_if(pairing.onlyRight.begin(), pairing.onlyRight.end(),
                       [&taken](uint32_t table) { return taken.count(table) != 0; }),
        pairing.onlyRight.end());
    return taken.size();
}

const char* PairedWord(PairedBy by)
{
    switch (by) {
    case PairedBy::Path:
        return "path";
    case PairedBy::Net:
        return "net";
    case PairedBy::Key:
        break;
    }
    return "key";
}

} // namespace booleq
