// Branch and bound over covering tables, depth first with an explicit stack.
#include <algorithm>
#include <cassert>
#include <cmath>
#include <numeric>

#include "covering.h"

namespace booleq {

namespace {

constexpr int kRootRounds = 400; // of the subgradient method
constexpr int kNodeRounds = 40;
constexpr double kTolerance = 1e-6;

// One part of the table: finds its cheapest cover.
class CoveringSearch {
  public:
    CoveringSearch(CoveringTable table, Work& work) : m_work(work)
    {
        m_open.push_back({std::move(table), {}, 0});
    }

    // Fills m_best, whatever the limits: if they are used up, it is a cover without a proof.
    void Begin()
    {
        const CoveringTable& table = m_open.back().table;
        std::vector<double> costs(table.costs.begin(), table.costs.end());
        Construct(m_open.back(), costs);
    }

    // Throws OutOfWork; m_best and LowerBound() are correct however it ends.
    void Run()
    {
        bool isRoot = true;
        while (!m_open.empty()) {
            Node node = std::move(m_open.back());
            m_open.pop_back();
            Expand(node, isRoot);
            isRoot = false;
        }
        m_root_bound = m_best_cost;
    }

    const std::vector<uint32_t>& Best() const { return m_best; }
    uint64_t BestCost() const { return m_best_cost; }
    uint64_t LowerBound() const { return std::min(m_root_bound, m_best_cost); }

  private:
    struct Node {
        CoveringTable table;
        std::vector<uint32_t> chosen; // by id
        uint64_t chosenCost;
    };

    void Expand(Node& node, bool isRoot)
    {
        for (;;) {
            std::vector<uint32_t> forced;
            const std::vector<uint32_t> ids = node.table.ids;
            const std::vector<uint64_t> costs = node.table.costs;
            ReduceCovering(node.table, forced, m_work);
            for (const uint32_t id : forced) {
                const auto place = std::find(ids.begin(), ids.end(), id);
                Choose(node, id, costs[static_cast<size_t>(place - ids.begin())]);
            }
            if (node.table.rows.empty()) {
                Offer(node.chosen, node.chosenCost);
                return;
            }
            if (node.chosenCost >= m_best_cost || !Bound(node, isRoot))
                return;
            if (!Fix(node))
                break;
        }
        Branch(node);
    }

    static void Choose(Node& node, uint32_t id, uint64_t cost)
    {
        node.chosen.push_back(id);
        node.chosenCost += cost;
    }

    void Offer(const std::vector<uint32_t>& chosen, uint64_t cost)
    {
        if (cost < m_best_cost) {
            m_best_cost = cost;
            m_best = chosen;
        }
    }

    // Raises the multipliers. False if the node cannot hold a cheaper cover. Leaves the best bound
    // in m_bound and its reduced costs in m_reduced.
    bool Bound(Node& node, bool isRoot)
    {
        CoveringTable& table = node.table;
        std::vector<double> multipliers = StartMultipliers(table);
        std::vector<double> best = multipliers;
        m_bound = -1;
        double step = isRoot ? 1.0 : 0.3;
        int numStale = 0;
        const int rounds = isRoot ? kRootRounds : kNodeRounds;
        for (int round = 0; round < rounds; ++round) {
            std::vector<double> reduced;
            const double bound = Dual(table, multipliers, reduced);
            if (bound > m_bound + 1e-9) {
                m_bound = bound;
                best = multipliers;
                m_reduced = reduced;
                numStale = 0;
            } else if (++numStale >= 15) {
                step /= 2;
                numStale = 0;
            }
            if (round % 10 == 0)
                Construct(node, reduced);
            if (IsHopeless(node) || step < 1e-3 ||
                !Climb(table, reduced, bound, step, node, multipliers))
                break;
        }
        table.multipliers = best;
        if (isRoot)
            m_root_bound = std::min(m_best_cost, node.chosenCost + RoundedBound());
        return !IsHopeless(node);
    }

    uint64_t RoundedBound() const
    {
        return static_cast<uint64_t>(std::max(0.0, std::ceil(m_bound - kTolerance)));
    }

    bool IsHopeless(const Node& node) const
    {
        return node.chosenCost + RoundedBound() >= m_best_cost;
    }

    static std::vector<double> StartMultipliers(const CoveringTable& table)
    {
        std::vector<double> multipliers = table.multipliers;
        for (size_t row = 0; row < multipliers.size(); ++row) {
            if (multipliers[row] >= 0)
                continue;
            double least = 1e300; // the least share of a column's cost
            for (const uint32_t column : table.rows[row])
                least = std::min(least, static_cast<double>(table.costs[column]) /
                                            static_cast<double>(table.columns[column].size()));
            multipliers[row] = least;
        }
        return multipliers;
    }

    double Dual(const CoveringTable& table, const std::vector<double>& multipliers,
                std::vector<double>& reduced)
    {
        double bound = std::accumulate(multipliers.begin(), multipliers.end(), 0.0);
        reduced.assign(table.costs.begin(), table.costs.end());
        for (size_t column = 0; column < table.costs.size(); ++column) {
            m_work.Spend(table.columns[column].size());
            for (const uint32_t row : table.columns[column])
                reduced[column] -= multipliers[row];
            bound += std::min(0.0, reduced[column]);
        }
        return bound;
    }

    // One step along the subgradient. False if it is zero.
    bool Climb(const CoveringTable& table, const std::vector<double>& reduced, double bound,
               double step, const Node& node, std::vector<double>& multipliers) const
    {
        std::vector<double> gradient(table.rows.size(), 1.0);
        for (size_t column = 0; column < reduced.size(); ++column)
            if (reduced[column] < 0)
                for (const uint32_t row : table.columns[column])
                    gradient[row] -= 1.0;
        double norm = 0;
        for (size_t row = 0; row < gradient.size(); ++row) {
            if (gradient[row] < 0 && multipliers[row] <= 0)
                gradient[row] = 0;
            norm += gradient[row] * gradient[row];
        }
        if (norm == 0)
            return false;
        const double target = static_cast<double>(m_best_cost - node.chosenCost);
        const double length = step * std::max(1.05 * target - bound, 0.05) / norm;
        for (size_t row = 0; row < gradient.size(); ++row)
            multipliers[row] = std::max(0.0, multipliers[row] + length * gradient[row]);
        return true;
    }

    // Makes a cover of the node from columns that cost little for the rows they add; columns that
    // turn out not to be needed are dropped again.
    void Construct(const Node& node, const std::vector<double>& prices)
    {
        const CoveringTable& table = node.table;
        std::vector<uint32_t> numCovers(table.rows.size(), 0);
        std::vector<uint32_t> taken;
        const auto take = [&](uint32_t column) {
            taken.push_back(column);
            for (const uint32_t row : table.columns[column])
                ++numCovers[row];
        };
        for (uint32_t column = 0; column < prices.size(); ++column)
            if (prices[column] <= 0)
                take(column);
        std::vector<uint32_t> order(table.rows.size());
        std::iota(order.begin(), order.end(), 0u);
        std::sort(order.begin(), order.end(), [&](uint32_t left, uint32_t right) {
            return table.rows[left].size() < table.rows[right].size();
        });
        for (const uint32_t row : order) {
            if (numCovers[row] != 0)
                continue;
            uint32_t best = table.rows[row][0];
            double bestPrice = 1e300;
            for (const uint32_t column : table.rows[row]) {
                size_t numNew = 0;
                for (const uint32_t other : table.columns[column])
                    numNew += numCovers[other] == 0 ? 1 : 0;
                const double price = (prices[column] + 1e-9) / static_cast<double>(numNew);
                if (price < bestPrice) {
                    bestPrice = price;
                    best = column;
                }
            }
            take(best);
        }
        Trim(node, taken, numCovers);
    }

    void Trim(const Node& node, std::vector<uint32_t>& taken, std::vector<uint32_t>& numCovers)
    {
        const CoveringTable& table = node.table;
        std::stable_sort(taken.begin(), taken.end(), [&](uint32_t left, uint32_t right) {
            const double leftShare = static_cast<double>(table.costs[left]) /
                                     static_cast<double>(table.columns[left].size());
            const double rightShare = static_cast<double>(table.costs[right]) /
                                      static_cast<double>(table.columns[right].size());
            return leftShare > rightShare;
        });
        std::vector<uint32_t> chosen = node.chosen;
        uint64_t cost = node.chosenCost;
        for (const uint32_t column : taken) {
            const std::vector<uint32_t>& rows = table.columns[column];
            if (std::all_of(rows.begin(), rows.end(),
                            [&](uint32_t row) { return numCovers[row] > 1; })) {
                for (const uint32_t row : rows)
                    --numCovers[row];
                continue;
            }
            chosen.push_back(table.ids[column]);
            cost += table.costs[column];
        }
        assert(std::find(numCovers.begin(), numCovers.end(), 0u) == numCovers.end());
        Offer(chosen, cost);
    }

    // Takes columns in or out as reduced costs show. True if that changed the node.
    bool Fix(Node& node)
    {
        CoveringTable& table = node.table;
        std::vector<uint8_t> isRow(table.rows.size(), 1);
        std::vector<uint8_t> isColumn(table.costs.size(), 1);
        const double room = static_cast<double>(m_best_cost - node.chosenCost) - 1 + kTolerance;
        bool isChanged = false;
        for (size_t column = 0; column < table.costs.size(); ++column) {
            const double reduced = m_reduced[column];
            const bool isOut = reduced > 0 && m_bound + reduced > room;
            const bool isIn = reduced < 0 && m_bound - reduced > room;
            if (!isOut && !isIn)
                continue;
            isColumn[column] = 0;
            isChanged = true;
            if (isIn) {
                Choose(node, table.ids[column], table.costs[column]);
                for (const uint32_t row : table.columns[column])
                    isRow[row] = 0;
            }
        }
        if (isChanged && !Restrict(table, isRow, isColumn))
            node.chosenCost = m_best_cost; // a row has lost all columns: nothing cheaper is here
        return isChanged;
    }

    // Calls KeepInTable. False if a row would be left without columns.
    static bool Restrict(CoveringTable& table, const std::vector<uint8_t>& isRow,
                         const std::vector<uint8_t>& isColumn)
    {
        for (size_t row = 0; row < table.rows.size(); ++row) {
            const std::vector<uint32_t>& columns = table.rows[row];
            if (isRow[row] != 0 &&
                std::none_of(columns.begin(), columns.end(),
                             [&](uint32_t column) { return isColumn[column] != 0; }))
                return false;
        }
        KeepInTable(table, isRow, isColumn);
        return true;
    }

    // Branches with the cheapest column of a shortest row, then without it.
    void Branch(Node& node)
    {
        const CoveringTable& table = node.table;
        const auto shortest = std::min_element(
            table.rows.begin(), table.rows.end(),
            [](const auto& left, const auto& right) { return left.size() < right.size(); });
        const uint32_t column = *std::min_element(
            shortest->begin(), shortest->end(),
            [&](uint32_t left, uint32_t right) { return m_reduced[left] < m_reduced[right]; });
        Node with = node;
        Node without = std::move(node);
        std::vector<uint8_t> isRow(with.table.rows.size(), 1);
        std::vector<uint8_t> isColumn(with.table.costs.size(), 1);
        isColumn[column] = 0;
        Choose(with, with.table.ids[column], with.table.costs[column]);
        if (Restrict(without.table, isRow, isColumn))
            m_open.push_back(std::move(without));
        for (const uint32_t row : with.table.columns[column])
            isRow[row] = 0;
        KeepInTable(with.table, isRow, isColumn);
        m_open.push_back(std::move(with));
    }

    Work& m_work;
    std::vector<Node> m_open;
    std::vector<uint32_t> m_best;
    uint64_t m_best_cost = UINT64_MAX;
    uint64_t m_root_bound = 0;
    double m_bound = 0;
    std::vector<double> m_reduced;
};

CoveringTable TableOf(const CoveringProblem& problem)
{
    CoveringTable table;
    table.rows = problem.rows;
    table.costs = problem.costs;
    table.ids.resize(problem.costs.size());
    std::iota(table.ids.begin(), table.ids.end(), 0u);
    table.multipliers.assign(problem.rows.size(), -1.0); // not known yet
    KeepInTable(table, std::vector<uint8_t>(table.rows.size(), 1),
                std::vector<uint8_t>(table.costs.size(), 1));
    return table;
}

} // namespace

CoveringResult SolveCovering(const CoveringProblem& problem, uint64_t maxUnits, Work& work)
{
    const uint64_t outerLimit = work.Limit();
    work.SetLimit(maxUnits > outerLimit - std::min(work.Spent(), outerLimit)
                      ? outerLimit
                      : work.Spent() + maxUnits);
    CoveringTable table = TableOf(problem);
    CoveringResult result;
    std::vector<uint32_t> forced;
    bool isOut = false;
    try {
        ReduceCovering(table, forced, work);
    } catch (const OutOfWork&) {
        isOut = true;
    }
    for (const uint32_t id : forced) {
        result.columns.push_back(id);
        result.cost += problem.costs[id];
        result.lowerBound += problem.costs[id];
    }
    for (CoveringTable& part : SplitTable(table)) {
        CoveringSearch search(std::move(part), work);
        search.Begin();
        try {
            if (!isOut)
                search.Run();
        } catch (const OutOfWork&) {
            isOut = true;
        }
        result.columns.insert(result.columns.end(), search.Best().begin(), search.Best().end());
        result.cost += search.BestCost();
        result.lowerBound += search.LowerBound();
    }
    work.SetLimit(outerLimit);
    std::sort(result.columns.begin(), result.columns.end());
    assert(result.lowerBound <= result.cost);
    assert(std::all_of(problem.rows.begin(), problem.rows.end(), [&](const auto& row) {
        return std::any_of(row.begin(), row.end(), [&](uint32_t column) {
            return std::binary_search(result.columns.begin(), result.columns.end(), column);
        });
    }));
    return result;
}

} // namespace booleq
