// The classical loop: expand, irredundant, essential primes set aside, then reduce, expand and
// irredundant as long as that gains, then last gasp.
#include "two_level.h"

#include <cstdio>
#include "expand.h"
#include "reduce.h"
#include "unate.h"

namespace booleq {

CoverCost CostOf(const CubeSpace& space, const CubeList& cubes)
{
    return {cubes.Size(), CountLiterals(space, cubes)};
}

bool IsCheaper(const CoverCost& left, const CoverCost& right)
{
    if (left.numTerms != right.numTerms)
        return left.numTerms < right.numTerms;
    return left.numLiterals < right.numLiterals;
}

namespace {

class SmallSumSearch {
  public:
    SmallSumSearch(const TwoLevelProblem& problem, Work& work)
        : m_space(problem.space), m_work(work), m_free(problem.free),
          m_expander(m_space, problem.off, work), m_cover(m_space.NumWords()),
          m_essential(m_space.NumWords())
    {
        m_cover.cubes = problem.on;
    }

    CubeList Run()
    {
        UniteOutputs(m_space, m_cover.cubes);
        RemoveContained(m_cover.cubes, m_work);
        m_cover.isPrime.assign(m_cover.cubes.Size(), 0);
        ExpandCover(m_space, m_expander, nullptr, m_cover, m_work);
        MakeIrredundant(m_space, m_cover, m_free, m_work);
        SetEssentialAside();
        do
            Improve();
        while (GainByLastGasp());
        m_cover.cubes.Append(m_essential);
        m_cover.isPrime.resize(m_cover.cubes.Size(), 1);
        m_free.Resize(m_num_given_free);
        MakeSparse(m_space, m_expander, m_cover, m_free, m_work);
        return m_cover.cubes;
    }

  private:
    void SetEssentialAside()
    {
        std::vector<uint8_t> isEssential = FindEssential(m_space, m_cover.cubes, m_free, m_work);
        m_num_given_free = m_free.Size();
        for (size_t index = 0; index < isEssential.size(); ++index) {
            if (isEssential[index] != 0) {
                m_essential.Append(m_cover.cubes.At(index));
                m_free.Append(m_cover.cubes.At(index));
            }
            isEssential[index] ^= 1;
        }
        m_cover.cubes.Keep(isEssential);
        m_cover.isPrime.assign(m_cover.cubes.Size(), 1);
    }

    void Improve()
    {
        bool isBySize = false;
        int numStale = 0;
        Cover best = m_cover;
        while (numStale < 2 && !m_cover.cubes.IsEmpty()) {
            ReduceCover(m_space, m_cover, m_free, isBySize, m_work);
            ExpandCover(m_space, m_expander, nullptr, m_cover, m_work);
            MakeIrredundant(m_space, m_cover, m_free, m_work);
            isBySize = !isBySize;
            ++numStale;
            const CoverCost cost = CostOf(m_space, m_cover.cubes);
            const CoverCost bestCost = CostOf(m_space, best.cubes);
            if (IsCheaper(cost, bestCost)) {
                if (cost.numTerms < bestCost.numTerms)
                    numStale = 0;
                best = m_cover;
            }
        }
        m_cover = best;
    }

    bool GainByLastGasp()
    {
        if (m_cover.cubes.Size() < 2)
            return false;
        Cover gasp = m_cover;
        if (AddLastGasp(m_space, m_expander, gasp, m_free, m_work) == 0)
            return false;
        MakeIrredundant(m_space, gasp, m_free, m_work);
        const bool isGain = gasp.cubes.Size() < m_cover.cubes.Size();
        if (isGain)
            m_cover = gasp;
        return isGain;
    }

    const CubeSpace& m_space;
    Work& m_work;
    CubeList m_free; // as given, then the essential primes
    size_t m_num_given_free = 0;
    Expander m_expander;
    Cover m_cover;
    CubeList m_essential;
};

} // namespace

CubeList FindSmallSum(const TwoLevelProblem& problem, Work& work)
{
    return SmallSumSearch(problem, work).Run();
}

bool IsSumRight(const TwoLevelProblem& problem, const CubeList& sum, Work& work)
{
    const CubeSpace& space = problem.space;
    for (size_t index = 0; index < problem.on.Size(); ++index)
        if (!IsCovered(space, problem.on.At(index), sum, sum.Size(), problem.free, work))
            return false;
    for (size_t index = 0; index < sum.Size(); ++index)
        if (!IsCovered(space, sum.At(index), problem.on, problem.on.Size(), problem.free, work))
            return false;
    return true;
}

} // namespace booleq
