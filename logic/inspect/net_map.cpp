#include "net_map.h"

#include <cassert>
#include <unordered_map>

namespace booleq {

namespace {

ScopedIndex IndexNets(const Design& design)
{
    ScopedIndex index(design);
    for (NetId net = kNumFixedNets; net < design.nets.size(); ++net)
        index.Add(design.nets[net], net);
    for (const auto& alias : design.aliases)
        if (alias.first >= kNumFixedNets)
            index.Add(alias.second, alias.first);
    return index;
}

// For each net, whether a table drives or reads it.
std::vector<bool> NetsOfTables(const Design& design)
{
    std::vector<bool> isUsed(design.nets.size(), false);
    for (const DesignTable& table : design.tables)
        isUsed[table.output] = true;
    for (const NetId net : design.inputs)
        isUsed[net] = true;
    return isUsed;
}

// Fills in the nets that have the wanted paths; the others stay kNotThere.
void FindPaths(const Design& design, std::unordered_map<std::string, NetId>& wanted)
{
    const auto look = [&](const ScopedName& name, NetId net) {
        const auto found = wanted.find(Path(design, name));
        if (found != wanted.end() && found->second == kNotThere)
            found->second = net;
    };
    for (NetId net = kNumFixedNets; net < design.nets.size(); ++net)
        look(design.nets[net], net);
    for (const auto& alias : design.aliases)
        if (alias.first >= kNumFixedNets)
            look(alias.second, alias.first);
}

Renames JoinRenamed(const Design& left, const Design& right, const Renames& renames, NetMap& nets)
{
    Renames unused;
    if (renames.empty())
        return unused;
    std::unordered_map<std::string, NetId> lefts;
    std::unordered_map<std::string, NetId> rights;
    for (const auto& rename : renames) {
        lefts.emplace(rename.first, kNotThere);
        rights.emplace(rename.second, kNotThere);
    }
    FindPaths(left, lefts);
    FindPaths(right, rights);
    for (const auto& rename : renames) {
        const NetId leftNet = lefts[rename.first];
        const NetId rightNet = rights[rename.second];
        if (leftNet == kNotThere || rightNet == kNotThere || nets.IsKnownLeft(leftNet) ||
            nets.IsKnownRight(rightNet))
            unused.push_back(rename);
        else
            nets.Join(leftNet, rightNet);
    }
    return unused;
}

} // namespace

NetMap::NetMap(const Design& left, const Design& right)
    : m_rights(left.nets.size(), kNotThere), m_numbers(right.nets.size())
{
    assert(left.nets.size() >= kNumFixedNets && right.nets.size() >= kNumFixedNets);
    for (NetId net = 0; net < m_numbers.size(); ++net)
        m_numbers[net] = static_cast<NetId>(m_rights.size()) + net;
    for (NetId net = 0; net < kNumFixedNets; ++net) {
        m_rights[net] = net;
        m_numbers[net] = net;
    }
}

void NetMap::Join(NetId left, NetId right)
{
    assert(left < m_rights.size() && right < m_numbers.size());
    assert(!IsKnownLeft(left));
    assert(!IsKnownRight(right));
    m_rights[left] = right;
    m_numbers[right] = left;
    ++m_num_known;
}

NameJoins JoinByNames(const Design& left, const Design& right, const NameMatch& match,
                      const Renames& renames, NetMap& nets)
{
    NameJoins joins;
    joins.unused = JoinRenamed(left, right, renames, nets);
    const ScopedIndex index = IndexNets(right);
    const std::vector<bool> isUsedLeft = NetsOfTables(left);
    const std::vector<bool> isUsedRight = NetsOfTables(right);
    const auto join = [&](NetId net, const ScopedName& name) {
        if (nets.IsKnownLeft(net))
            return;
        const NetId found = match.Find(name, index);
        if (found == kNotThere || nets.IsKnownRight(found))
            return;
        if (isUsedLeft[net] && isUsedRight[found])
            nets.Join(net, found);
        else if (isUsedLeft[net] || isUsedRight[found])
            joins.doubtful.emplace_back(net, found);
    };
    for (NetId net = kNumFixedNets; net < left.nets.size(); ++net)
        join(net, left.nets[net]);
    for (const auto& alias : left.aliases)
        if (alias.first >= kNumFixedNets)
            join(alias.first, alias.second);
    return joins;
}

std::string NumberName(const Design& left, const Design& right, const NetMap& nets, NetId number)
{
    return nets.IsLeft(number) ? NetName(left, number) : NetName(right, nets.RightOf(number));
}

} // namespace booleq
