// Rows by signatures, columns by hitting sets, then covering.
#include "exact.h"

#include <algorithm>

#include "blocking.h"
#include "covering.h"
#include "expand.h"
#include "reduce.h"
#include "unate.h"

namespace booleq {

namespace {

constexpr size_t kMaxColumns = 400000;
// If there are more rows than this for each cube, rows are moved to harder ones. Each then costs
// more.
constexpr size_t kHardFactor = 20;

class ExactSearch {
  public:
    ExactSearch(const TwoLevelProblem& problem, const CubeList& start, Goal goal, Work& work)
        : m_space(problem.space), m_problem(problem), m_goal(goal), m_work(work),
          m_expander(problem, work), m_off(m_space, problem.off), m_no_cubes(m_space.NumWords()),
          m_none(m_space, m_no_cubes, false), m_start(start), m_essential(m_space.NumWords()),
          m_fixed(problem.free), m_rows(m_space.NumWords()), m_signatures(m_space.NumWords()),
          m_result(m_space)
    {
        m_result.sum = start;
    }

    ExactResult Run()
    {
        try {
            SetEssentialAside();
            FindRows();
            FindNeighbours();
            if (m_goal == Goal::Terms)
                CountTerms();
            CountBoth();
        } catch (const OutOfWork&) {
            BoundByStrangers();
        }
        return m_result;
    }

  private:
    void SetEssentialAside()
    {
        for (size_t index = 0; index < m_start.Size(); ++index)
            m_expander.Expand(m_start.At(index), nullptr, m_none);
        m_start.SortAndUnite();
        m_result.sum = m_start;
        std::vector<uint8_t> isEssential = FindEssential(m_space, m_start, m_problem.free, m_work);
        for (size_t index = 0; index < isEssential.size(); ++index) {
            if (isEssential[index] != 0) {
                m_essential.Append(m_start.At(index));
                m_fixed.Append(m_start.At(index));
            }
            isEssential[index] ^= 1;
        }
        m_start.Keep(isEssential);
        assert(m_start.Size() + m_essential.Size() == m_result.sum.Size());
        m_result.lowerBound = BaseCost();
        m_are_essential_known = true;
    }

    size_t BaseCost() const
    {
        return m_goal == Goal::Terms ? m_essential.Size() : CountLiterals(m_space, m_essential);
    }

    // Finds rows of outputs that no essential prime covers, until the signatures of these rows
    // cover everything.
    void FindRows()
    {
        CubeList known = m_fixed;
        m_point.resize(m_space.NumWords());
        for (size_t index = 0; index < m_start.Size(); ++index) {
            UncoveredRows search(m_space, m_start.At(index), known, m_work);
            while (search.Next(m_point.data())) {
                Row row = RowAt(m_point.data());
                while (m_rows.Size() > kHardFactor * m_start.Size() && MoveToHarder(row)) {
                }
                m_rows.Append(row.point.data());
                m_signatures.Append(row.signature.data());
                m_blocking.push_back(row.blocking);
                known.Append(row.signature.data());
                search.Cover(row.signature.data());
            }
        }
        DropImpliedRows();
    }

    struct Row {
        std::vector<uint64_t> point;
        std::vector<uint64_t> signature;
        CubeList blocking;
    };

    Row RowAt(const uint64_t* point)
    {
        Row row = {std::vector<uint64_t>(point, point + m_space.NumWords()),
                   std::vector<uint64_t>(m_space.NumWords()),
                   FindBlockingSets(m_space, m_off, point, m_work)};
        FindSignature(m_space, row.blocking, row.signature.data());
        assert(Contains(row.signature.data(), point, m_space.NumWords()));
        return row;
    }

    // Moves to a neighbouring row that fewer primes cover, all of which cover this one as well.
    bool MoveToHarder(Row& row)
    {
        const size_t numBits = 2 * m_space.NumInputs() + m_space.NumOutputs();
        size_t output = 2 * m_space.NumInputs();
        while (!GetBit(row.point.data(), output))
            ++output;
        std::vector<uint64_t> point;
        for (size_t bit = 0; bit < numBits; bit += bit < 2 * m_space.NumInputs() ? 2 : 1) {
            point = row.point;
            if (bit < 2 * m_space.NumInputs()) {
                point[bit / 64] ^= uint64_t(3) << (bit % 64);
            } else {
                ClearBit(point.data(), output);
                SetBit(point.data(), bit);
            }
            if (!IsOpenRow(point.data()) || !IsImplicantWith(row.point, point))
                continue;
            Row other = RowAt(point.data());
            if (Contains(other.signature.data(), row.signature.data(), m_space.NumWords()) &&
                other.signature != row.signature) {
                row = std::move(other);
                return true;
            }
        }
        return false;
    }

    bool IsImplicantWith(const std::vector<uint64_t>& left, std::vector<uint64_t> right)
    {
        for (size_t word = 0; word < right.size(); ++word)
            right[word] |= left[word];
        return m_expander.IsImplicant(right.data());
    }

    // Whether the row is on, and neither free nor covered by an essential prime.
    bool IsOpenRow(const uint64_t* point)
    {
        m_work.Spend(m_fixed.Size());
        for (size_t index = 0; index < m_fixed.Size(); ++index)
            if (Contains(m_fixed.At(index), point, m_space.NumWords()))
                return false;
        return m_expander.IsImplicant(point);
    }

    // A row in the signature of another one is covered whenever the other one is.
    void DropImpliedRows()
    {
        std::vector<uint8_t> isKept(m_rows.Size(), 1);
        for (size_t row = 0; row < m_rows.Size(); ++row) {
            m_work.Spend(m_rows.Size());
            for (size_t other = 0; other < m_rows.Size() && isKept[row] != 0; ++other)
                if (other != row && isKept[other] != 0 &&
                    Contains(m_signatures.At(other), m_rows.At(row), m_space.NumWords()))
                    isKept[row] = 0;
        }
        size_t numKept = 0;
        for (size_t row = 0; row < isKept.size(); ++row)
            if (isKept[row] != 0 && numKept++ != row)
                m_blocking[numKept - 1] = std::move(m_blocking[row]);
        m_blocking.resize(numKept, CubeList(m_space.NumWords()));
        m_rows.Keep(isKept);
        assert(m_rows.Size() == numKept);
        assert(m_blocking.size() == numKept);
        m_signatures.Keep(isKept);
    }

    // Finds the pairs of rows that one product can hold.
    void FindNeighbours()
    {
        const size_t numWords = m_space.NumWords();
        m_neighbours.resize(m_rows.Size());
        std::vector<uint64_t> both(numWords);
        for (size_t row = 0; row < m_rows.Size(); ++row) {
            for (size_t other = 0; other < row; ++other) {
                for (size_t word = 0; word < numWords; ++word)
                    both[word] = m_rows.At(row)[word] | m_rows.At(other)[word];
                if (!m_expander.IsImplicant(both.data()))
                    continue;
                m_neighbours[row].push_back(static_cast<uint32_t>(other));
                m_neighbours[other].push_back(static_cast<uint32_t>(row));
            }
        }
        m_are_neighbours_known = true;
    }

    // The fewest terms. Only parts count that another row could need.
    void CountTerms()
    {
        CubeList columns(m_space.NumWords());
        std::vector<uint64_t> parts(m_space.NumWords());
        for (size_t row = 0; row < m_rows.Size(); ++row) {
            CopyCube(parts.data(), m_rows.At(row), parts.size());
            for (const uint32_t other : m_neighbours[row])
                for (size_t word = 0; word < parts.size(); ++word)
                    parts[word] |= m_rows.At(other)[word];
            if (!FindPrimes(m_space, m_blocking[row], parts.data(), kMaxColumns - columns.Size(),
                            m_work, columns))
                throw OutOfWork{false};
        }
        columns.Append(m_start);
        columns.SortAndUnite();
        CoveringProblem problem;
        problem.costs.assign(columns.Size(), 1);
        Solve(problem, columns);
        m_result.lowerBound = m_essential.Size() + static_cast<size_t>(m_bound);
        assert(m_result.lowerBound <= m_result.sum.Size());
        m_result.isProved = m_result.lowerBound == m_result.sum.Size();
    }

    // What counts first, then what counts second, over all primes of the rows.
    void CountBoth()
    {
        std::vector<uint64_t> parts(m_space.NumWords());
        for (size_t word = 0; word < parts.size(); ++word)
            parts[word] = m_space.All(word);
        CubeList columns(m_space.NumWords());
        for (const CubeList& blocking : m_blocking)
            if (!FindPrimes(m_space, blocking, parts.data(), kMaxColumns - columns.Size(), m_work,
                            columns))
                throw OutOfWork{false};
        columns.SortAndUnite();
        const uint64_t most = CountLiterals(m_space, m_result.sum) + m_result.sum.Size() + 1;
        CoveringProblem problem;
        for (size_t index = 0; index < columns.Size(); ++index) {
            const uint64_t numLiterals = CountCubeLiterals(m_space, columns.At(index));
            problem.costs.push_back(m_goal == Goal::Terms ? most + numLiterals
                                                          : most * numLiterals + 1);
        }
        const uint64_t cost = Solve(problem, columns);
        const size_t firstBound = static_cast<size_t>(m_bound / most) + BaseCost();
        if (firstBound > m_result.lowerBound)
            m_result.lowerBound = firstBound;
        m_result.isProved = m_result.isProved || m_result.lowerBound == FirstCount();
        assert(m_bound <= cost);
        m_result.isSecondProved = m_bound == cost;
    }

    size_t FirstCount() const
    {
        return m_goal == Goal::Terms ? m_result.sum.Size() : CountLiterals(m_space, m_result.sum);
    }

    // Fills in the rows of the problem, solves it, and takes the sum if it is better. Returns its
    // cost; the bound is in m_bound.
    uint64_t Solve(CoveringProblem& problem, const CubeList& columns)
    {
        problem.rows.resize(m_rows.Size());
        for (size_t row = 0; row < m_rows.Size(); ++row) {
            m_work.Spend(columns.Size());
            for (size_t column = 0; column < columns.Size(); ++column)
                if (Contains(columns.At(column), m_rows.At(row), m_space.NumWords()))
                    problem.rows[row].push_back(static_cast<uint32_t>(column));
        }
        const CoveringResult result = SolveCovering(problem, UINT64_MAX, m_work);
        assert(result.lowerBound <= result.cost);
        m_bound = result.lowerBound;
        CubeList sum = m_essential;
        for (const uint32_t column : result.columns) {
            sum.Append(columns.At(column));
            uint64_t* cube = sum.At(sum.Size() - 1);
            m_expander.Expand(cube, nullptr, m_none);
        }
        const CoverCost cost = CostOf(m_space, sum);
        const CoverCost best = CostOf(m_space, m_result.sum);
        const bool isBetter = m_goal == Goal::Terms ? IsCheaper(cost, best)
                                                    : IsCheaper({cost.numLiterals, cost.numTerms},
                                                                {best.numLiterals, best.numTerms});
        if (isBetter)
            m_result.sum = sum;
        return result.cost;
    }

    // Rows, no two of which fit into one product, need one term each.
    void BoundByStrangers()
    {
        if (!m_are_neighbours_known || m_goal != Goal::Terms)
            return;
        std::vector<uint8_t> isOut(m_rows.Size(), 0);
        std::vector<uint32_t> order(m_rows.Size());
        for (size_t row = 0; row < order.size(); ++row)
            order[row] = static_cast<uint32_t>(row);
        std::stable_sort(order.begin(), order.end(), [&](uint32_t left, uint32_t right) {
            return m_neighbours[left].size() < m_neighbours[right].size();
        });
        size_t numStrangers = 0;
        for (const uint32_t row : order) {
            if (isOut[row] != 0)
                continue;
            ++numStrangers;
            for (const uint32_t other : m_neighbours[row])
                isOut[other] = 1;
        }
        m_result.lowerBound = std::max(m_result.lowerBound, m_essential.Size() + numStrangers);
        assert(m_result.lowerBound <= m_result.sum.Size());
        m_result.isProved = m_result.lowerBound == m_result.sum.Size();
    }

    const CubeSpace& m_space;
    const TwoLevelProblem& m_problem;
    Goal m_goal;
    Work& m_work;
    Expander m_expander;
    const CubeIndex m_off;
    const CubeList m_no_cubes;
    const OpenCubes m_none;
    CubeList m_start; // primes; later only those that are not essential
    CubeList m_essential;
    CubeList m_fixed; // free, and the essential primes
    std::vector<uint64_t> m_point;
    CubeList m_rows; // each is one row of one output
    CubeList m_signatures;
    std::vector<CubeList> m_blocking;
    std::vector<std::vector<uint32_t>> m_neighbours;
    uint64_t m_bound = 0;
    bool m_are_essential_known = false;
    bool m_are_neighbours_known = false;
    ExactResult m_result;
};

} // namespace

ExactResult FindSmallestSum(const TwoLevelProblem& problem, const CubeList& start, Goal goal,
                            Work& work)
{
    return ExactSearch(problem, start, goal, work).Run();
}

} // namespace booleq
