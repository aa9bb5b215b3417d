// Expand, irredundant and reduce by rows. Rows that can grow least are covered first, because they
// leave the least choice (S. J. Hong, R. Cain, D. Ostapko, MINI: a heuristic approach for logic
// minimization, 1974).
#include "row_sum.h"

#include <algorithm>
#include <numeric>

namespace booleq {

namespace {

// Turns go on until one removes less than a 512th of the terms, or until so much work is spent.
constexpr size_t kMinGain = 512;
constexpr uint64_t kTurnUnits = uint64_t(96) << 20;

class RowSumSearch {
  public:
    RowSumSearch(const RowTable& rows, Work& work)
        : m_rows(rows), m_work(work), m_num_inputs(rows.numInputs),
          m_counts(rows.needed.size() * rows.numOutputs), m_open(rows.needed), m_single(rows.needed)
    {
    }

    std::vector<RowCube> Run()
    {
        const Work::Clock::time_point deadline = m_work.Deadline();
        m_work.SetDeadline(Work::Clock::time_point::max()); // there must be an answer
        Cover();
        DropRedundant();
        const uint64_t limit = m_work.Spent() + kTurnUnits;
        for (size_t before = SIZE_MAX; m_work.Spent() < limit && Work::Clock::now() < deadline;) {
            if (before - m_cubes.size() <= before / kMinGain)
                break;
            before = m_cubes.size();
            Turn();
            DropRedundant();
            assert(m_cubes.size() <= before);
        }
        MakeSparse();
        DropRedundant();
        m_work.SetDeadline(deadline);
        return m_cubes;
    }

  private:
    uint32_t AllInputs() const { return (uint32_t(1) << m_num_inputs) - 1u; }
    void Add(const RowCube& cube) { Count(cube, 1); }
    void Remove(const RowCube& cube) { Count(cube, UINT32_MAX); }

    // Adds 'step' to the number of cubes that cover what the cube has; keeps m_open and m_single.
    void Count(const RowCube& cube, uint32_t step)
    {
        m_work.Spend(NumRowsOf(cube));
        ForEachRow(cube, [&](uint32_t row) {
            for (uint64_t rest = cube.outputs & m_rows.needed[row]; rest != 0; rest &= rest - 1) {
                const uint64_t bit = rest & (~rest + 1);
                uint32_t& count = m_counts[row * m_rows.numOutputs + LowestBit(rest)];
                count += step;
                m_open[row] = count == 0 ? m_open[row] | bit : m_open[row] & ~bit;
                m_single[row] = count <= 1 ? m_single[row] | bit : m_single[row] & ~bit;
            }
        });
    }

    // Pairs of row and output; rows with the fewest neighbours that may have the output come first.
    std::vector<uint32_t> OrderPairs() const
    {
        const size_t numOutputs = m_rows.numOutputs;
        std::vector<uint8_t> degrees;
        std::vector<uint32_t> pairs;
        std::vector<size_t> starts(m_num_inputs + 2);
        for (size_t row = 0; row < m_rows.needed.size(); ++row) {
            for (uint64_t rest = m_rows.needed[row]; rest != 0; rest &= rest - 1) {
                const size_t output = LowestBit(rest);
                size_t degree = 0;
                for (size_t input = 0; input < m_num_inputs; ++input)
                    degree +=
                        static_cast<size_t>(m_rows.allowed[row ^ size_t(1) << input] >> output & 1);
                degrees.push_back(static_cast<uint8_t>(degree));
                pairs.push_back(static_cast<uint32_t>(row * numOutputs + output));
                ++starts[degree + 1];
            }
        }
        std::partial_sum(starts.begin(), starts.end(), starts.begin());
        std::vector<uint32_t> order(pairs.size());
        for (size_t place = 0; place < pairs.size(); ++place)
            order[starts[degrees[place]]++] = pairs[place];
        return order;
    }

    void Cover()
    {
        for (const uint32_t pair : OrderPairs()) {
            const uint32_t row = pair / static_cast<uint32_t>(m_rows.numOutputs);
            const uint64_t output = uint64_t(1) << pair % m_rows.numOutputs;
            if ((m_open[row] & output) == 0)
                continue;
            const RowCube cube = Expand({0, row, output}, m_open);
            Add(cube);
            m_cubes.push_back(cube);
        }
    }

    // The outputs that the cube may have.
    uint64_t AllowedOf(const RowCube& cube) const
    {
        uint64_t allowed = ~uint64_t(0);
        ForEachRow(cube, [&](uint32_t row) { allowed &= m_rows.allowed[row]; });
        return allowed;
    }

    // Grows a cube to take in as much of 'worth' as it can: first wherever it keeps the outputs of
    // 'cube', back to the stage at which it was worth most, then wherever it keeps its outputs of
    // that stage.
    RowCube Expand(const RowCube& cube, const std::vector<uint64_t>& worth)
    {
        RowCube grown = cube;
        grown.outputs = AllowedOf(cube);
        assert((cube.outputs & ~grown.outputs) == 0);
        RowCube best = grown;
        size_t bestWorth = WorthOf(grown, worth);
        uint32_t candidates = AllInputs() & ~cube.open;
        size_t grownWorth = 0;
        while (GrowOnce(grown, cube.outputs, worth, candidates, grownWorth)) {
            if (grownWorth < bestWorth)
                continue;
            best = grown;
            bestWorth = grownWorth;
        }
        if (best.open == grown.open)
            return best;
        candidates = AllInputs() & ~best.open;
        const uint64_t outputs = best.outputs;
        while (GrowOnce(best, outputs, worth, candidates, grownWorth)) {
        }
        return best;
    }

    size_t WorthOf(const RowCube& cube, const std::vector<uint64_t>& worth) const
    {
        size_t total = 0;
        ForEachRow(cube, [&](uint32_t row) { total += CountBits(worth[row] & cube.outputs); });
        return total;
    }

    // Opens the input that makes the cube worth most and leaves it 'outputs'. Inputs that cannot be
    // opened leave 'candidates'. False if none is left.
    bool GrowOnce(RowCube& cube, uint64_t outputs, const std::vector<uint64_t>& worth,
                  uint32_t& candidates, size_t& bestWorth)
    {
        RowCube best = cube;
        bestWorth = 0;
        const size_t numRows = NumRowsOf(cube);
        const size_t ownWorth = WorthOf(cube, worth);
        for (uint32_t rest = candidates; rest != 0; rest &= rest - 1) {
            const uint32_t bit = rest & (~rest + 1);
            RowCube half = cube; // what it would gain
            half.values ^= bit;
            half.outputs &= AllowedOf(half);
            m_work.Spend(numRows);
            if ((outputs & ~half.outputs) != 0) {
                candidates &= ~bit;
                continue;
            }
            RowCube own = cube;
            own.outputs = half.outputs;
            const size_t gained = WorthOf(half, worth) +
                                  (half.outputs == cube.outputs ? ownWorth : WorthOf(own, worth));
            if (best.open != cube.open && gained <= bestWorth)
                continue;
            best = {cube.open | bit, cube.values & ~bit, half.outputs};
            bestWorth = gained;
        }
        if (best.open == cube.open)
            return false;
        candidates &= ~best.open;
        cube = best;
        return true;
    }

    // The smallest cube with everything that only this cube of the cover has. No outputs if that is
    // nothing.
    RowCube Reduced(const RowCube& cube) const
    {
        uint32_t ones = 0;
        uint32_t zeros = 0;
        uint64_t outputs = 0;
        ForEachRow(cube, [&](uint32_t row) {
            const uint64_t own = m_single[row] & cube.outputs;
            if (own == 0)
                return;
            outputs |= own;
            ones |= row;
            zeros |= ~row;
        });
        return {ones & zeros, ones & ~zeros, outputs};
    }

    // The order that puts first the cubes that alone cover the least.
    std::vector<uint32_t> OrderByOwn()
    {
        std::vector<uint32_t> order(m_cubes.size());
        std::vector<size_t> owns(m_cubes.size());
        std::iota(order.begin(), order.end(), 0u);
        for (size_t index = 0; index < m_cubes.size(); ++index) {
            m_work.Spend(NumRowsOf(m_cubes[index]));
            owns[index] = WorthOf(m_cubes[index], m_single);
        }
        std::stable_sort(order.begin(), order.end(),
                         [&](uint32_t left, uint32_t right) { return owns[left] < owns[right]; });
        return order;
    }

    void DropRedundant()
    {
        for (const uint32_t index : OrderByOwn()) {
            if (Reduced(m_cubes[index]).outputs != 0)
                continue;
            Remove(m_cubes[index]);
            m_cubes[index].outputs = 0;
        }
        DropEmpty();
    }

    void DropEmpty()
    {
        const auto isEmpty = [](const RowCube& cube) { return cube.outputs == 0; };
        m_cubes.erase(std::remove_if(m_cubes.begin(), m_cubes.end(), isEmpty), m_cubes.end());
    }

    // Each cube becomes as small as the others allow, then grows over what only one other cube
    // covers.
    void Turn()
    {
        for (const uint32_t index : OrderByOwn()) {
            RowCube& cube = m_cubes[index];
            const RowCube reduced = Reduced(cube);
            Remove(cube);
            cube.outputs = 0;
            if (reduced.outputs == 0)
                continue;
            cube = Expand(reduced, m_single);
            Add(cube);
        }
        DropEmpty();
    }

    // Removes outputs that others cover, then inputs that the remaining outputs do not need.
    void MakeSparse()
    {
        for (RowCube& cube : m_cubes) {
            const RowCube reduced = Reduced(cube);
            Remove(cube);
            cube.outputs = reduced.outputs;
            if (reduced.outputs == 0) // a cube that grew earlier has taken it in
                continue;
            uint32_t candidates = AllInputs() & ~cube.open;
            size_t worth = 0;
            while (GrowOnce(cube, reduced.outputs, m_open, candidates, worth))
                assert(cube.outputs == reduced.outputs);
            Add(cube);
        }
        DropEmpty();
    }

    const RowTable& m_rows;
    Work& m_work;
    size_t m_num_inputs;
    std::vector<RowCube> m_cubes;
    std::vector<uint32_t> m_counts; // cubes that have an output of a row, if it is needed there
    std::vector<uint64_t> m_open;   // needed, in no cube
    std::vector<uint64_t> m_single; // needed, in at most one cube
};

} // namespace

CubeList FindSumOfRows(const CubeSpace& space, const RowTable& rows, Work& work)
{
    CubeList sum(space.NumWords());
    for (const RowCube& cube : RowSumSearch(rows, work).Run()) {
        sum.Resize(sum.Size() + 1);
        FromRowCube(space, cube, sum.At(sum.Size() - 1));
    }
    assert(IsSumOfRows(space, rows, sum, work));
    return sum;
}

} // namespace booleq
