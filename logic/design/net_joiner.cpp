#include "net_joiner.h"

#include <algorithm>
#include <cassert>
#include <utility>

namespace booleq {

void NetJoiner::Hide(NetId net)
{
    if (m_is_hidden.size() <= net)
        m_is_hidden.resize(std::max<size_t>(net + size_t(1), m_is_hidden.size() * 2), false);
    m_is_hidden[net] = true;
}

// Shortens the chain on the way.
NetId NetJoiner::Root(NetId net)
{
    if (net >= m_parents.size())
        return net;
    while (m_parents[net] != net) {
        assert(m_parents[net] < net);
        m_parents[net] = m_parents[m_parents[net]];
        net = m_parents[net];
    }
    return net;
}

void NetJoiner::Join(NetId first, NetId second)
{
    assert(first != kNetOpen && first != kNetUnknown);
    assert(second != kNetOpen && second != kNetUnknown);
    NetId low = Root(first);
    NetId high = Root(second);
    if (low == high || (low == kNetZero && high == kNetOne) || (low == kNetOne && high == kNetZero))
        return; // a net tied to both 0 and 1 keeps the first
    if (low > high)
        std::swap(low, high);
    for (auto net = static_cast<NetId>(m_parents.size()); net <= high; ++net)
        m_parents.push_back(net);
    m_parents[high] = low;
}

void NetJoiner::Apply(Design& design)
{
    if (m_parents.empty())
        return;
    const auto numNets = static_cast<NetId>(design.nets.size());
    for (NetId net = kNumFixedNets; net < numNets; ++net) {
        const NetId root = Root(net);
        if (root == net)
            continue;
        if (root >= kNumFixedNets && IsHidden(root) && !IsHidden(net)) {
            std::swap(design.nets[root], design.nets[net]);
            m_is_hidden[root] = false;
        }
        design.aliases.emplace_back(root, design.nets[net]);
    }
    std::vector<NetId> numbers(numNets);
    NetId next = 0;
    for (NetId net = 0; net < numNets; ++net) {
        const NetId root = Root(net);
        numbers[net] = root == net ? next++ : numbers[root];
        if (root == net)
            design.nets[numbers[net]] = design.nets[net];
    }
    assert(numbers[kNetOpen] == kNetOpen);
    design.nets.resize(next);
    for (DesignTable& table : design.tables)
        table.output = numbers[table.output];
    for (NetId& input : design.inputs)
        input = numbers[input];
    for (auto& alias : design.aliases)
        alias.first = numbers[alias.first];
    for (DesignPort& port : design.ports)
        port.net = numbers[port.net];
}

} // namespace booleq
