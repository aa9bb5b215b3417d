// From a table to a proved sum.
#include "sum.h"

#include <algorithm>
#include <stdexcept>

#include "cofactors.h"
#include "reduce.h"
#include "unate.h"

namespace booleq {

namespace {

// Without --exact an exact search is tried with as much work as the heuristic took, and a
// little; where that was much it would need far more, so there is a limit.
constexpr uint64_t kTrialShare = 1;
constexpr uint64_t kTrialUnits = 1u << 20;
constexpr uint64_t kMaxTrialUnits = 3u << 20;

void SetSeconds(double seconds, Work& work)
{
    if (seconds > 0)
        work.SetDeadline(Work::Clock::now() + std::chrono::duration_cast<Work::Clock::duration>(
                                                  std::chrono::duration<double>(seconds)));
}

bool DoCoverAll(const CubeSpace& space, const CubeList& cubes, CubeIndex& first, CubeIndex& second,
                Work& work)
{
    Cofactors cofactors(space, first, second, work);
    for (size_t index = 0; index < cubes.Size(); ++index)
        if (!cofactors.Cover(cubes.At(index), SIZE_MAX))
            return false;
    return true;
}

// What is on lies in the sum; the free cubes, which may be many, are asked where it does not.
bool IsOnCovered(const Pla& table, CubeIndex& sum, CubeIndex& free, Work& work)
{
    const CubeList none(table.space.NumWords());
    CubeIndex noIndex(table.space, none);
    Cofactors ofSum(table.space, sum, noIndex, work);
    Cofactors ofBoth(table.space, sum, free, work);
    for (size_t index = 0; index < table.on.Size(); ++index)
        if (!ofSum.Cover(table.on.At(index), SIZE_MAX) &&
            !ofBoth.Cover(table.on.At(index), SIZE_MAX))
            return false;
    return true;
}

bool IsSumRight(const Pla& table, const CubeList& sum, Work& work)
{
    const CubeSpace& space = table.space;
    CubeIndex sumIndex(space, sum);
    CubeIndex onIndex(space, table.on);
    CubeIndex freeIndex(space, table.free);
    if (!IsOnCovered(table, sumIndex, freeIndex, work))
        return false;
    if (table.type == PlaType::Fr || table.type == PlaType::Fdr) {
        size_t left = 0;
        size_t right = 0;
        return !FindMeeting(space, sum, table.off, work, left, right);
    }
    return DoCoverAll(space, sum, onIndex, freeIndex, work); // everything else is off
}

// The inverted sum: 1 on every row that nothing is said of or that is off; 0 where on and not free.
bool IsInversionRight(const Pla& table, const CubeList& sum, Work& work)
{
    const CubeSpace& space = table.space;
    const bool areZerosGiven = table.type == PlaType::Fr || table.type == PlaType::Fdr;
    const CubeList none(space.NumWords());
    CubeIndex sumIndex(space, sum);
    CubeIndex freeIndex(space, table.free);
    CubeIndex noIndex(space, none);
    if (areZerosGiven) {
        if (!DoCoverAll(space, table.off, sumIndex, noIndex, work))
            return false;
    } else {
        CubeList known = table.on;
        known.Append(table.free);
        std::vector<uint64_t> all(space.NumWords());
        for (size_t word = 0; word < all.size(); ++word)
            all[word] = space.All(word);
        if (!IsCovered(space, all.data(), sum, known, work))
            return false;
    }
    Cofactors ofFree(space, freeIndex, noIndex, work);
    std::vector<uint64_t> common(space.NumWords());
    std::vector<uint32_t> found;
    for (size_t index = 0; index < table.on.Size(); ++index) {
        sumIndex.Find(table.on.At(index), 0, work, found);
        for (const uint32_t term : found) {
            for (size_t word = 0; word < common.size(); ++word)
                common[word] = table.on.At(index)[word] & sum.At(term)[word];
            if (!ofFree.Cover(common.data(), SIZE_MAX))
                return false;
        }
    }
    return true;
}

// Where nothing is known of the off-set an exact search has no rows to start from, but a sum of
// essential primes has no rival: each has a row that no other prime covers, so each sum has a term
// within it for that row, with no fewer literals.
void ProveByEssential(const TwoLevelProblem& problem, Goal goal, Sum& sum, Work& work)
{
    const CubeSpace& space = problem.space;
    work.SetDeadline(Work::Clock::time_point::max()); // less than the search before
    Expander expander(problem, work);
    Cover primes(space.NumWords());
    primes.cubes = sum.cubes;
    primes.isPrime.assign(sum.cubes.Size(), 0);
    ExpandCover(space, expander, primes, work);
    std::vector<uint8_t> isEssential = FindEssential(space, primes.cubes, problem.free, work);
    primes.cubes.Keep(isEssential);
    ShedOutputs(problem, sum.cubes, work);
    sum.cost = CostOf(space, sum.cubes);
    assert(primes.cubes.Size() <= sum.cost.numTerms); // a cover has them all
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

} // namespace

bool Minimise(const Pla& table, const SumOptions& options, Sum& sum, PlaFault& fault, Work& work)
{
    TwoLevelProblem problem(table.space);
    if (!ToProblem(table, problem, fault, work))
        return false;
    if (options.isInverted && !problem.hasOff) {
        fault = {0, "a product of sums needs cubes of the rows that are 0, and there are too many",
                 "ask for a sum of products"};
        return false;
    }
    if (options.isInverted) {
        TwoLevelProblem inverted(table.space);
        inverted.on = problem.off;
        inverted.free = problem.free;
        SetOff(inverted, work);
        problem = inverted;
    }
    SetSeconds(options.seconds, work);
    sum.cubes = FindSmallSum(problem, work);
    if (problem.hasOff)
        Improve(problem, options, sum, work);
    else
        ProveByEssential(problem, options.goal, sum, work);
    if (!IsSumOf(table, sum.cubes, options.isInverted, work))
        throw std::logic_error("the sum found is not the function: please report this");
    return true;
}

bool IsSumOf(const Pla& table, const CubeList& sum, bool isInverted, Work& work)
{
    return isInverted ? IsInversionRight(table, sum, work) : IsSumRight(table, sum, work);
}

} // namespace booleq
