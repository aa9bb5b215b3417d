// From a table to a proved sum.
#include "sum.h"

#include <algorithm>
#include <stdexcept>

#include "proof.h"
#include "reduce.h"
#include "row_sum.h"

namespace booleq {

namespace {

// Without --exact an exact search may take as much work as the heuristic did, and a little more.
// There is a limit, because after a lot of work it would need far more.
constexpr uint64_t kTrialShare = 1;
constexpr uint64_t kTrialUnits = 1u << 20;
constexpr uint64_t kMaxTrialUnits = 3u << 20;
constexpr size_t kManyPairs = 20000; // pairs of a cube and an output that it has on
constexpr size_t kManyCubes = 16384;

void SetSeconds(double seconds, Work& work)
{
    if (seconds > 0)
        work.SetDeadline(Work::Clock::now() + std::chrono::duration_cast<Work::Clock::duration>(
                                                  std::chrono::duration<double>(seconds)));
}

// If the off-set is not known, an exact search has no rows to start from. But no other sum beats
// one of essential primes: each has a row that no other prime covers, so each sum has a term inside
// that prime for the row, with no fewer literals.
void ProveByEssential(const TwoLevelProblem& problem, Goal goal, Sum& sum, Work& work)
{
    const CubeSpace& space = problem.space;
    work.SetDeadline(Work::Clock::time_point::max());
    Expander expander(problem, work);
    Cover primes(space.NumWords());
    primes.cubes = sum.cubes;
    primes.isPrime.assign(sum.cubes.Size(), 0);
    ExpandCover(space, expander, primes, work);
    std::vector<uint8_t> isEssential = FindEssential(space, primes.cubes, problem.free, work);
    primes.cubes.Keep(isEssential);
    ShedOutputs(problem, sum.cubes, work);
    sum.cost = CostOf(space, sum.cubes);
    assert(primes.cubes.Size() <= sum.cost.numTerms); // a cover contains all of them
    const bool areAllEssential = primes.cubes.Size() == sum.cost.numTerms;
    if (goal == Goal::Terms) {
        sum.lowerBound = primes.cubes.Size();
        sum.isProved = areAllEssential;
    } else {
        sum.lowerBound = CountLiterals(space, primes.cubes);
        sum.isProved = sum.lowerBound == sum.cost.numLiterals;
    }
    sum.isSecondProved =
        areAllEssential && CountLiterals(space, primes.cubes) == sum.cost.numLiterals;
}

void TryEssential(const TwoLevelProblem& problem, Goal goal, Sum& sum, Work& work)
{
    const uint64_t limit = work.Limit();
    work.SetLimit(std::min(limit, 2 * work.Spent() + kTrialUnits));
    try {
        ProveByEssential(problem, goal, sum, work);
    } catch (const OutOfWork&) {
        // the sum stays as it was found
    }
    work.SetLimit(limit);
}

void Improve(const TwoLevelProblem& problem, const SumOptions& options, Sum& sum, Work& work)
{
    const uint64_t limit = work.Limit();
    if (!options.isExact)
        work.SetLimit(work.Spent() +
                      std::min(kMaxTrialUnits, kTrialUnits + kTrialShare * work.Spent()));
    const ExactResult exact = FindSmallestSum(problem, sum.cubes, options.goal, work);
    work.SetLimit(limit);
    work.SetDeadline(Work::Clock::time_point::max());
    sum.cubes = exact.sum;
    ShedOutputs(problem, sum.cubes, work);
    sum.cost = CostOf(problem.space, sum.cubes);
    sum.lowerBound = exact.lowerBound;
    sum.isProved = exact.isProved;
    sum.isSecondProved = exact.isSecondProved;
    assert(sum.lowerBound <=
           (options.goal == Goal::Terms ? sum.cost.numTerms : sum.cost.numLiterals));
}

// Whether there are so many rows that growing cube by cube against the off-set would take seconds.
bool IsLong(const Pla& table)
{
    const size_t numCubes = table.on.Size() + table.free.Size() + table.off.Size();
    size_t numPairs = numCubes > kManyCubes ? kManyPairs + 1 : 0;
    for (size_t index = 0; index < table.on.Size() && numPairs <= kManyPairs; ++index)
        numPairs += CountOutputs(table.space, table.on.At(index));
    return numPairs > kManyPairs && CanListRows(table);
}

// Takes the sum by rows if it is cheaper than the present one.
void TakeSumOfRows(const Pla& table, const SumOptions& options, Sum& sum, Work& work)
{
    const RowTable rows = ListRows(table, options.isInverted, work);
    const CubeList found = FindSumOfRows(table.space, rows, work);
    const CoverCost cost = CostOf(table.space, found);
    if (sum.cubes.IsEmpty() || IsCheaper(cost, CostOf(table.space, sum.cubes)))
        sum.cubes = found;
}

bool Invert(TwoLevelProblem& problem, PlaFault& fault, Work& work)
{
    if (!problem.hasOff) {
        fault = {0, "a product of sums needs cubes of the rows that are 0, and there are too many",
                 "ask for a sum of products"};
        return false;
    }
    TwoLevelProblem inverted(problem.space);
    inverted.on = problem.off;
    inverted.free = problem.free;
    SetOff(inverted, work);
    problem = inverted;
    return true;
}

} // namespace

bool Minimise(const Pla& table, const SumOptions& options, Sum& sum, PlaFault& fault, Work& work)
{
    if (!IsConsistent(table, fault, work))
        return false;
    const bool isLong = IsLong(table);
    if (isLong) {
        SetSeconds(options.seconds, work);
        TakeSumOfRows(table, options, sum, work);
        work.SetDeadline(Work::Clock::time_point::max());
    }
    if (!isLong || options.isExact) {
        TwoLevelProblem problem(table.space);
        if (!ToProblem(table, problem, fault, work) ||
            (options.isInverted && !Invert(problem, fault, work)))
            return false;
        SetSeconds(options.seconds, work);
        if (!isLong)
            sum.isCutShort = !FindSmallSum(problem, work, sum.cubes);
        if (sum.isCutShort && CanListRows(table)) {
            TakeSumOfRows(table, options, sum, work);
            sum.isCutShort = false;
        }
        if (problem.hasOff && !sum.isCutShort)
            Improve(problem, options, sum, work);
        else if (!sum.isCutShort)
            TryEssential(problem, options.goal, sum, work);
        work.SetDeadline(Work::Clock::time_point::max());
    }
    sum.cost = CostOf(table.space, sum.cubes);
    sum.lowerBound = std::max<size_t>(sum.lowerBound, sum.cubes.IsEmpty() ? 0 : 1);
    if (!IsSumOf(table, sum.cubes, options.isInverted, work))
        throw std::logic_error("the sum found is not the function: please report this");
    return true;
}

} // namespace booleq
