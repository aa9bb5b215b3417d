#include "comparison.h"

#include <algorithm>
#include <cassert>

#include "canonical.h"
#include "function.h"
#include "match.h"
#include "parallel.h"
#include "structure.h"

namespace booleq {

namespace {

// Names say nothing if there are more pairs by key than by name.
bool SaysNothingByName(const Pairing& pairing)
{
    const auto numByKey =
        std::count_if(pairing.pairs.begin(), pairing.pairs.end(),
                      [](const TablePair& pair) { return pair.by == PairedBy::Key; });
    return 2 * static_cast<size_t>(numByKey) > pairing.pairs.size();
}

// The nets of both functions, in the order of the left pins, then of the right pins.
std::vector<NetId> NetOrder(const PinFunction& left, const PinFunction& right,
                            const NetFunction& leftFunction, const NetFunction& rightFunction)
{
    std::vector<NetId> order;
    const auto add = [&order](const std::vector<NetId>& pins, const std::vector<NetId>& nets) {
        for (const NetId net : pins)
            if (std::find(nets.begin(), nets.end(), net) != nets.end() &&
                std::find(order.begin(), order.end(), net) == order.end())
                order.push_back(net);
    };
    add(left.nets, leftFunction.nets);
    add(right.nets, rightFunction.nets);
    add(left.nets, rightFunction.nets);
    return order;
}

// For functions of unknown nets alone, of which there are too many to try all assignments.
bool IsSameInSomeOrder(const Rows& left, const Rows& right)
{
    const unsigned int numInputs = left.NumInputs();
    if (numInputs <= kMaxCanonicalInputs)
        return FindCanonical(left.Words()[0], numInputs, CanonicalScope::Order).form ==
               FindCanonical(right.Words()[0], numInputs, CanonicalScope::Order).form;
    std::vector<std::string> names; // arbitrary: only places count
    for (unsigned int input = 0; input < numInputs; ++input)
        names.push_back("n" + std::to_string(input));
    constexpr double kSeconds = 1; // for one table; one that takes longer counts as different
    return booleq::Match(Function(names, left), Function(names, right), false, kSeconds).isFound;
}

void TieOpenInputs(Design& design, NetId by)
{
    if (by != kNetOpen)
        std::replace(design.inputs.begin(), design.inputs.end(), kNetOpen, by);
}

} // namespace

Comparison::Comparison(Design& left, Design& right, const CompareOptions& options)
    : m_left(left), m_right(right), m_match(left, right), m_nets(left, right),
      m_follows_wires(options.followsWires), m_is_renamed(left.nets.size(), false)
{
    TieOpenInputs(left, options.openInputs);
    TieOpenInputs(right, options.openInputs);
    Match(options);
    CompareAll(options);
}

void Comparison::Match(const CompareOptions& options)
{
    m_are_names_gone = options.names == NetNames::Gone;
    NetPairs doubtful;
    if (!m_are_names_gone) {
        NameJoins joins = JoinByNames(m_left, m_right, m_match, options.renames, m_nets);
        m_unused_renames = std::move(joins.unused);
        doubtful = std::move(joins.doubtful);
        m_pairing = PairTables(m_left, m_right, m_match, m_nets, PairWays::All);
        m_are_names_gone = options.names == NetNames::Auto && SaysNothingByName(m_pairing);
    }
    if (m_are_names_gone) {
        m_nets = NetMap(m_left, m_right);
        doubtful.clear();
        m_pairing = PairTables(m_left, m_right, m_match, m_nets, PairWays::Key);
    }
    if (options.followsWires) {
        FollowWires(m_left, m_pairing.onlyLeft);
        FollowWires(m_right, m_pairing.onlyRight);
    }
    // A net that was found may be the output of further tables, which can then be paired.
    for (bool isMore = true; isMore;) {
        const NetPairs joined = JoinByStructure(m_left, m_right, m_pairing, doubtful, m_nets);
        for (const auto& pair : joined) {
            m_is_renamed[pair.first] = !m_are_names_gone;
            if (!m_are_names_gone)
                m_renamed.push_back({pair.first, pair.second, 0});
        }
        isMore = !joined.empty() && PairRest(m_left, m_right, m_nets, m_pairing) > 0;
    }
    JoinDoubtful(doubtful, m_nets);
}

bool Comparison::HasRenamed(const TablePair& pair) const
{
    const DesignTable& table = m_left.tables[pair.left];
    const NetId* const inputs = m_left.Inputs(table);
    return m_is_renamed[table.output] ||
           std::any_of(inputs, inputs + m_left.NumInputs(table),
                       [this](NetId net) { return m_is_renamed[net]; });
}

// If names are gone, an output that is not connected is ignored: for a cell that is used only for
// its carry, the file may or may not connect the output.
Comparison::Verdict Comparison::CompareOutputs(const TablePair& pair) const
{
    const NetId left = m_left.tables[pair.left].output;
    const NetId right = m_right.tables[pair.right].output;
    if (m_nets.NumberOfRight(right) == left)
        return Verdict::Same;
    const bool isOpen = left < kNumFixedNets || right < kNumFixedNets;
    const bool isUnknown = !isOpen && !m_nets.IsKnownLeft(left) && !m_nets.IsKnownRight(right);
    return m_are_names_gone && (isOpen || isUnknown) ? Verdict::Same : Verdict::Different;
}

Comparison::Verdict Comparison::Compare(const TablePair& pair) const
{
    const NetFunction left = LeftFunction(m_left, pair.left);
    const NetFunction right = RightFunction(m_right, pair.right, m_nets);
    if (CompareOutputs(pair) == Verdict::Different)
        return Verdict::Different;
    if (left == right)
        return HasRenamed(pair) ? Verdict::Renamed : Verdict::Same;
    if (left.nets.size() != right.nets.size())
        return Verdict::Different;
    // A known net must be the same on both sides, so only unknown nets may be taken in any order.
    const bool isSame =
        left.nets.size() > Assignments::kMaxNets && IsAllUnknown(left, right, m_nets)
            ? IsSameInSomeOrder(left.rows, right.rows)
            : FindAssignments(left, right, m_nets, Assignments::kMaxNetsOnce).number > 0;
    if (isSame)
        return m_are_names_gone ? Verdict::SameByOrder : Verdict::Renamed;
    return Verdict::Different;
}

void Comparison::CompareAll(const CompareOptions& options)
{
    constexpr size_t kBlock = 65536; // pairs between two calls of 'progress'
    constexpr size_t kPart = 512;    // pairs for a thread at a time: a millisecond or less
    std::vector<Verdict> verdicts(m_pairing.pairs.size());
    for (size_t first = 0; first < verdicts.size(); first += kBlock) {
        if (options.progress)
            options.progress(options.progressContext, first, verdicts.size());
        const size_t count = std::min(kBlock, verdicts.size() - first);
        RunInParts(count, kPart, LutWork(), [&](size_t begin, size_t end) {
            for (size_t place = first + begin; place < first + end; ++place)
                verdicts[place] = Compare(m_pairing.pairs[place]);
        });
    }
    std::vector<uint64_t> counts(m_left.nets.size(), 0); // pairs that have a renamed net
    for (size_t place = 0; place < verdicts.size(); ++place)
        Count(m_pairing.pairs[place], verdicts[place], counts);
    assert(m_num_same + m_num_renamed + m_different.size() == m_pairing.pairs.size());
    for (RenamedNet& net : m_renamed)
        net.numTables = counts[net.left];
    // Drops nets that occur only in tables that differ anyway.
    m_renamed.erase(std::remove_if(m_renamed.begin(), m_renamed.end(),
                                   [](const RenamedNet& net) { return net.numTables == 0; }),
                    m_renamed.end());
}

void Comparison::Count(const TablePair& pair, Verdict verdict, std::vector<uint64_t>& counts)
{
    switch (verdict) {
    case Verdict::SameByOrder:
        ++m_num_by_order;
        ++m_num_same;
        break;
    case Verdict::Same:
        ++m_num_same;
        break;
    case Verdict::Renamed:
        ++m_num_renamed;
        CountRenamed(pair, counts);
        break;
    case Verdict::Different:
        m_different.push_back(pair);
        break;
    }
}

void Comparison::CountRenamed(const TablePair& pair, std::vector<uint64_t>& counts) const
{
    const DesignTable& table = m_left.tables[pair.left];
    std::vector<NetId> nets(m_left.Inputs(table), m_left.Inputs(table) + m_left.NumInputs(table));
    nets.push_back(table.output);
    std::sort(nets.begin(), nets.end());
    nets.erase(std::unique(nets.begin(), nets.end()), nets.end());
    for (const NetId net : nets)
        counts[net] += m_is_renamed[net] ? 1 : 0;
}

Difference Comparison::Describe(const TablePair& pair) const
{
    Difference difference;
    const PinFunction left = PinsOf(m_left, m_left.tables[pair.left]);
    PinFunction right = PinsOf(m_right, m_right.tables[pair.right]);
    for (NetId& net : right.nets)
        net = m_nets.NumberOfRight(net);
    difference.leftFunction = Normalise(left);
    difference.rightFunction = Normalise(right);
    Rows expected;
    if (RightRows(difference.leftFunction, right, expected))
        difference.expectedInit = HexOf(expected);
    if (difference.leftFunction == difference.rightFunction) {
        difference.isSameFunction = true;
        difference.causes.push_back({CauseCode::OutputMoved,
                                     {m_left.tables[pair.left].output,
                                      m_nets.NumberOfRight(m_right.tables[pair.right].output)},
                                     ""});
        return difference;
    }
    const std::vector<NetId> order =
        NetOrder(left, right, difference.leftFunction, difference.rightFunction);
    const std::vector<bool> values =
        FirstDifference(difference.leftFunction, difference.rightFunction, order);
    for (size_t place = 0; place < order.size(); ++place)
        difference.assignment.emplace_back(NameOf(order[place]), values[place]);
    difference.left = ValueAt(difference.leftFunction, order, values);
    difference.right = ValueAt(difference.rightFunction, order, values);
    assert(difference.left != difference.right);
    difference.causes = FindCauses(left, right);
    return difference;
}

std::string Comparison::NameOf(NetId number) const
{
    return NumberName(m_left, m_right, m_nets, number);
}

bool Comparison::HasOnlyWires(const Design& design, const std::vector<uint32_t>& tables) const
{
    return tables.empty() ||
           (m_follows_wires && std::all_of(tables.begin(), tables.end(),
                                           [&](uint32_t table) { return IsWire(design, table); }));
}

bool Comparison::IsSame() const
{
    return m_different.empty() && m_num_renamed == 0 && HasOnlyWires(m_left, m_pairing.onlyLeft) &&
           HasOnlyWires(m_right, m_pairing.onlyRight);
}

bool IsWire(const Design& design, uint32_t table)
{
    const NetFunction function = LeftFunction(design, table);
    return function.nets.empty() || (function.nets.size() == 1 && function.rows.At(1));
}

std::string WireText(const Design& design, uint32_t table)
{
    if (!IsWire(design, table))
        return std::string();
    const NetFunction function = Normalise(PinsOf(design, design.tables[table]));
    return function.nets.empty() ? (function.rows.At(0) ? "constant 1" : "constant 0")
                                 : "only passes " + NetName(design, function.nets.front());
}

} // namespace booleq
