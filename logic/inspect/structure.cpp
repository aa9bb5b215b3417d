#include "structure.h"

#include <algorithm>
#include <cassert>
#include <unordered_map>
#include <unordered_set>

#include "watch.h"

namespace booleq {

namespace {

constexpr unsigned int kMaxRounds = 64;

// Counts the votes of pairs of tables about which nets are the same.
class Votes {
  public:
    // A net that shares a name with another one needs two votes to be joined.
    explicit Votes(const NetPairs& doubtful)
    {
        for (const auto& pair : doubtful) {
            m_doubtful_lefts.insert(pair.first);
            m_doubtful_rights.insert(pair.second);
        }
    }

    void Add(NetId left, NetId right) { ++m_counts[uint64_t(left) << 32 | right]; }

    // Joins two nets if each has the most votes for the other. Clears the votes.
    void Join(NetMap& nets, NetPairs& joined)
    {
        std::unordered_map<NetId, Favourite> lefts;
        std::unordered_map<NetId, Favourite> rights;
        for (const auto& count : m_counts) {
            const auto left = static_cast<NetId>(count.first >> 32);
            const auto right = static_cast<NetId>(count.first);
            if (count.second < 2 &&
                (m_doubtful_lefts.count(left) != 0 || m_doubtful_rights.count(right) != 0))
                continue;
            lefts[left].Hear(right, count.second);
            rights[right].Hear(left, count.second);
        }
        const size_t numBefore = joined.size();
        for (const auto& left : lefts) {
            if (left.second.isTied)
                continue;
            const Favourite& back = rights[left.second.net];
            if (!back.isTied && back.net == left.first)
                joined.emplace_back(left.first, left.second.net);
        }
        std::sort(joined.begin() + static_cast<std::ptrdiff_t>(numBefore), joined.end());
        for (size_t place = numBefore; place < joined.size(); ++place)
            nets.Join(joined[place].first, joined[place].second);
        m_counts.clear();
    }

  private:
    struct Favourite {
        NetId net = kNotThere;
        uint32_t count = 0;
        bool isTied = false;

        void Hear(NetId other, uint32_t otherCount)
        {
            if (otherCount == count)
                isTied = true;
            if (otherCount <= count)
                return;
            net = other;
            count = otherCount;
            isTied = false;
        }
    };

    std::unordered_map<uint64_t, uint32_t> m_counts;
    std::unordered_set<NetId> m_doubtful_lefts;
    std::unordered_set<NetId> m_doubtful_rights;
};

std::vector<NetId> UnknownOf(const NetFunction& function, const NetMap& nets, bool isLeft)
{
    std::vector<NetId> unknown;
    for (const NetId net : function.nets)
        if (nets.IsLeft(net) == isLeft && !nets.IsKnown(net))
            unknown.push_back(net);
    return unknown;
}

NetFunction ReplaceAll(const NetFunction& function, const std::vector<NetId>& from,
                       const std::vector<NetId>& to)
{
    PinFunction pins = {function.rows, function.nets};
    for (NetId& net : pins.nets) {
        const auto found = std::find(from.begin(), from.end(), net);
        if (found != from.end())
            net = to[static_cast<size_t>(found - from.begin())];
    }
    return Normalise(std::move(pins));
}

void VoteForOutputs(const Design& left, const Design& right, const Pairing& pairing,
                    const NetMap& nets, Votes& votes)
{
    for (const TablePair& pair : pairing.pairs) {
        const NetId leftNet = left.tables[pair.left].output;
        const NetId rightNet = right.tables[pair.right].output;
        if (leftNet >= kNumFixedNets && rightNet >= kNumFixedNets && !nets.IsKnownLeft(leftNet) &&
            !nets.IsKnownRight(rightNet))
            votes.Add(leftNet, rightNet);
    }
}

bool HasUnknownInput(const Design& left, const DesignTable& table, const NetMap& nets)
{
    const NetId* const inputs = left.Inputs(table);
    return std::any_of(inputs, inputs + left.NumInputs(table),
                       [&nets](NetId net) { return !nets.IsKnownLeft(net); });
}

// Returns true if the pair may tell more in another round.
bool VoteForInputs(const NetFunction& left, const NetFunction& right, const NetMap& nets,
                   Votes& votes)
{
    if (UnknownOf(left, nets, true).empty() || left.nets.size() != right.nets.size())
        return false;
    const Assignments found = FindAssignments(left, right, nets);
    if (found.number != 1)
        return found.number > 1 || !found.isTried;
    for (const auto& pair : found.first)
        votes.Add(pair.first, nets.RightOf(pair.second));
    return true;
}

// Where a chain of wires begins. All nets on the way are then linked straight to that net. A ring
// ends at the net where it was entered.
NetId EndOf(NetId net, std::unordered_map<NetId, NetId>& sources)
{
    std::vector<NetId> passed;
    NetId end = net;
    for (auto source = sources.find(end); source != sources.end() && source->second != net;
         source = sources.find(end)) {
        passed.push_back(end);
        end = source->second;
        if (passed.size() > sources.size())
            break; // a ring that does not include 'net'
    }
    for (const NetId wire : passed)
        if (wire != end)
            sources[wire] = end;
    return end;
}

} // namespace

NetFunction LeftFunction(const Design& left, uint32_t table)
{
    return Normalise(PinsOf(left, left.tables[table]));
}

NetFunction RightFunction(const Design& right, uint32_t table, const NetMap& nets)
{
    PinFunction pins = PinsOf(right, right.tables[table]);
    for (NetId& net : pins.nets)
        net = nets.NumberOfRight(net);
    return Normalise(std::move(pins));
}

Assignments FindAssignments(const NetFunction& left, const NetFunction& right, const NetMap& nets,
                            unsigned int maxNets)
{
    Assignments found;
    const std::vector<NetId> unknownLeft = UnknownOf(left, nets, true);
    std::vector<NetId> unknownRight = UnknownOf(right, nets, false);
    if (unknownLeft.size() != unknownRight.size())
        return found;
    if (unknownLeft.size() > maxNets) {
        found.isTried = false;
        return found;
    }
    std::sort(unknownRight.begin(), unknownRight.end());
    do {
        if (ReplaceAll(right, unknownRight, unknownLeft) != left)
            continue;
        if (found.number++ > 0)
            return found;
        for (size_t place = 0; place < unknownLeft.size(); ++place)
            found.first.emplace_back(unknownLeft[place], unknownRight[place]);
    } while (std::next_permutation(unknownRight.begin(), unknownRight.end()));
    return found;
}

bool IsAllUnknown(const NetFunction& left, const NetFunction& right, const NetMap& nets)
{
    return UnknownOf(left, nets, true).size() == left.nets.size() &&
           UnknownOf(right, nets, false).size() == right.nets.size();
}

NetPairs JoinByStructure(const Design& left, const Design& right, const Pairing& pairing,
                         const NetPairs& doubtful, NetMap& nets)
{
    NetPairs joined;
    Votes votes(doubtful);
    VoteForOutputs(left, right, pairing, nets, votes);
    votes.Join(nets, joined);

    std::vector<const TablePair*> waiting;
    for (const TablePair& pair : pairing.pairs)
        if (HasUnknownInput(left, left.tables[pair.left], nets))
            waiting.push_back(&pair);
    for (unsigned int round = 0; round < kMaxRounds && !waiting.empty(); ++round) {
        std::vector<const TablePair*> rest;
        for (const TablePair* const pair : waiting) {
            Watch();
            if (VoteForInputs(LeftFunction(left, pair->left),
                              RightFunction(right, pair->right, nets), nets, votes))
                rest.push_back(pair);
        }
        const size_t numBefore = joined.size();
        votes.Join(nets, joined);
        if (joined.size() == numBefore)
            break;
        waiting = std::move(rest);
    }
    return joined;
}

void JoinDoubtful(const NetPairs& doubtful, NetMap& nets)
{
    for (const auto& pair : doubtful)
        if (!nets.IsKnownLeft(pair.first) && !nets.IsKnownRight(pair.second))
            nets.Join(pair.first, pair.second);
}

void FollowWires(Design& design, const std::vector<uint32_t>& tables)
{
    std::unordered_map<NetId, NetId> sources;
    for (const uint32_t table : tables) {
        const NetFunction function = LeftFunction(design, table);
        const NetId output = design.tables[table].output;
        if (output < kNumFixedNets)
            continue;
        if (function.nets.empty())
            sources[output] = function.rows.At(0) ? kNetOne : kNetZero;
        else if (function.nets.size() == 1 && function.rows.At(1) && function.nets[0] != output)
            sources[output] = function.nets[0];
    }
    for (NetId& net : design.inputs)
        net = EndOf(net, sources);
}

} // namespace booleq
