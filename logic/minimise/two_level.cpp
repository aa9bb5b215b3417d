// The classical loop: expand, irredundant, set essential primes aside; then reduce, expand and
// irredundant as long as that gains; then last gasp.
#include "two_level.h"

#include <algorithm>

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

constexpr uint64_t kPoolShare = 1;
constexpr uint64_t kMaxSpentForMore = 14u << 20; // beyond this, going on would take too long
constexpr size_t kMaxToCompare = 20000;
constexpr size_t kMaxSplit = 50000; // cubes of one output each, to start with
constexpr int kPoolRounds = 1;
constexpr int kPoolTurns = 3;
constexpr uint64_t kMaxUnits = uint64_t(1) << 31; // several seconds
constexpr uint64_t kMaxUnitsAtEnd = kMaxUnits / 8;

class SmallSumSearch {
  public:
    SmallSumSearch(const TwoLevelProblem& problem, Work& work)
        : m_space(problem.space), m_work(work), m_free(problem.free),
          m_num_given_free(m_free.Size()), m_expander(problem, work), m_cover(m_space.NumWords()),
          m_best(m_space.NumWords()), m_pool(m_space.NumWords()), m_essential(m_space.NumWords())
    {
    }

    bool Run(const CubeList& on, CubeList& sum)
    {
        const Work::Clock::time_point deadline = m_work.Deadline();
        const uint64_t limit = m_work.Limit();
        m_work.SetLimit(std::min(limit, m_work.Spent() + kMaxUnits));
        bool isWhole = Search(on);
        m_cover = m_best;
        assert(m_cover.cubes.Size() == m_cover.isPrime.size());
        m_cover.cubes.Append(m_essential);
        m_cover.isPrime.resize(m_cover.cubes.Size(), 1);
        assert(m_free.Size() == m_num_given_free + m_essential.Size());
        m_free.Resize(m_num_given_free);
        m_work.SetDeadline(Work::Clock::time_point::max());
        m_work.SetLimit(m_work.Spent() + kMaxUnitsAtEnd);
        try {
            MakeSparse(m_space, m_expander, m_cover, m_free, m_work);
        } catch (const OutOfWork&) {
            isWhole = false;
        }
        m_work.SetLimit(limit);
        m_work.SetDeadline(deadline);
        sum = m_cover.cubes;
        return isWhole;
    }

  private:
    // False if it ended early. m_best together with m_essential is a cover then too.
    bool Search(const CubeList& on)
    {
        bool isFirstDone = false;
        Cover first(m_space.NumWords());
        try {
            StartFrom(SplitOutputs(on));
            SetEssentialAside();
            m_best = m_cover;
            isFirstDone = true;
            Descend();
            if (m_work.Spent() > kMaxSpentForMore)
                return true;
            first = m_best;
            if (IsShared(on))
                DescendFromUnited(on);
            ChooseFromPool();
        } catch (const OutOfWork&) {
            if (!isFirstDone)
                m_best = m_cover;
            else if (!first.cubes.IsEmpty() && first.cubes.Size() < m_best.cubes.Size())
                m_best = first;
            return false;
        }
        return true;
    }

    void SetEssentialAside()
    {
        std::vector<uint8_t> isEssential = FindEssential(m_space, m_cover.cubes, m_free, m_work);
        for (size_t index = 0; index < isEssential.size(); ++index) {
            if (isEssential[index] != 0) {
                m_essential.Append(m_cover.cubes.At(index));
                m_free.Append(m_cover.cubes.At(index));
            }
            isEssential[index] ^= 1;
        }
        m_cover.cubes.Keep(isEssential);
        assert(m_cover.cubes.Size() + m_essential.Size() == isEssential.size());
        m_cover.isPrime.assign(m_cover.cubes.Size(), 1);
    }

    // Starts from a cube for each output, unless these are too many: a cube that several outputs
    // share is a choice that the search might not make.
    CubeList SplitOutputs(const CubeList& on) const
    {
        CubeList united = on;
        UniteOutputs(m_space, united);
        CubeList split(m_space.NumWords());
        for (size_t index = 0; index < united.Size(); ++index) {
            for (size_t output = 0; output < m_space.NumOutputs(); ++output) {
                if (!GetBit(united.At(index), m_space.OutputBit(output)))
                    continue;
                if (split.Size() == kMaxSplit)
                    return united;
                split.Append(united.At(index));
                uint64_t* cube = split.At(split.Size() - 1);
                for (size_t word = 0; word < m_space.NumWords(); ++word)
                    cube[word] &= m_space.Inputs(word);
                SetBit(cube, m_space.OutputBit(output));
            }
        }
        return split;
    }

    void StartFrom(CubeList cubes)
    {
        m_cover.cubes = std::move(cubes);
        if (m_cover.cubes.Size() <= kMaxToCompare) // expansion also takes in contained cubes
            RemoveContained(m_space, m_cover.cubes, m_work);
        m_cover.isPrime.assign(m_cover.cubes.Size(), 0);
        ExpandCover(m_space, m_expander, m_cover, m_work);
        m_pool.Append(m_cover.cubes);
        MakeIrredundant(m_space, m_cover, m_free, m_work);
    }

    // Turns and last gasps from m_cover, as long as they gain; m_best becomes the better of what it
    // was and the result.
    void Descend()
    {
        do
            Improve();
        while (GainByLastGasp());
    }

    // Whether a cube has several outputs; if not, both starts are the same.
    bool IsShared(const CubeList& on) const
    {
        CubeList united = on;
        UniteOutputs(m_space, united);
        for (size_t index = 0; index < united.Size(); ++index)
            if (CountOutputs(m_space, united.At(index)) > 1)
                return true;
        return false;
    }

    // The other start: products shared by outputs, as given.
    void DescendFromUnited(const CubeList& on)
    {
        const Cover best = m_best;
        CubeList united = on;
        UniteOutputs(m_space, united);
        StartFrom(std::move(united));
        m_best = m_cover;
        Descend();
        if (!IsCheaper(CostOf(m_space, m_best.cubes), CostOf(m_space, best.cubes)))
            m_best = best;
        m_cover = m_best;
    }

    void Improve()
    {
        bool isBySize = false;
        int numStale = 0;
        while (numStale < 2 && !m_cover.cubes.IsEmpty()) {
            Turn(isBySize);
            isBySize = !isBySize;
            ++numStale;
            const CoverCost cost = CostOf(m_space, m_cover.cubes);
            const CoverCost bestCost = CostOf(m_space, m_best.cubes);
            if (IsCheaper(cost, bestCost)) {
                if (cost.numTerms < bestCost.numTerms)
                    numStale = 0;
                m_best = m_cover;
            }
        }
        m_cover = m_best;
    }

    // Reduce, expand, irredundant. Primes found on the way are remembered.
    void Turn(bool isBySize)
    {
        ReduceCover(m_space, m_cover, m_free, isBySize, m_work);
        ExpandCover(m_space, m_expander, m_cover, m_work);
        m_pool.Append(m_cover.cubes);
        MakeIrredundant(m_space, m_cover, m_free, m_work);
    }

    // The best cover by any of the primes seen so far; further turns find more of them. Spends at
    // most a share of what has been spent before.
    void ChooseFromPool()
    {
        const uint64_t limit = m_work.Limit();
        m_work.SetLimit(std::min(limit, m_work.Spent() + m_work.Spent() * kPoolShare));
        bool isBySize = true;
        try {
            for (int numStale = 0; numStale < kPoolRounds && m_cover.cubes.Size() > 1; ++numStale) {
                for (int turn = 0; turn < kPoolTurns; ++turn, isBySize = !isBySize)
                    Turn(isBySize);
                m_pool.Append(m_best.cubes);
                m_pool.SortAndUnite();
                m_cover.cubes = m_pool;
                m_cover.isPrime.assign(m_pool.Size(), 1);
                MakeIrredundant(m_space, m_cover, m_free, m_work);
                const CoverCost cost = CostOf(m_space, m_cover.cubes);
                if (cost.numTerms < m_best.cubes.Size())
                    numStale = -1;
                if (IsCheaper(cost, CostOf(m_space, m_best.cubes)))
                    m_best = m_cover;
            }
        } catch (const OutOfWork& out) {
            if (out.isTime)
                throw;
        }
        m_work.SetLimit(limit);
        m_cover = m_best;
    }

    bool GainByLastGasp()
    {
        if (m_cover.cubes.Size() < 2)
            return false;
        Cover gasp = m_cover;
        if (AddLastGasp(m_space, m_expander, gasp, m_free, m_work) == 0)
            return false;
        m_pool.Append(gasp.cubes);
        MakeIrredundant(m_space, gasp, m_free, m_work);
        const bool isGain = gasp.cubes.Size() < m_cover.cubes.Size();
        if (isGain)
            m_best = m_cover = gasp;
        return isGain;
    }

    const CubeSpace& m_space;
    Work& m_work;
    CubeList m_free; // as given, then the essential primes
    size_t m_num_given_free;
    Expander m_expander;
    Cover m_cover;
    Cover m_best;
    CubeList m_pool; // primes; some occur more than once
    CubeList m_essential;
};

} // namespace

bool FindSmallSum(const TwoLevelProblem& problem, Work& work, CubeList& sum)
{
    return SmallSumSearch(problem, work).Run(problem.on, sum);
}

void ShedOutputs(const TwoLevelProblem& problem, CubeList& cubes, Work& work)
{
    Expander expander(problem, work);
    Cover cover(problem.space.NumWords());
    cover.cubes = cubes;
    cover.isPrime.assign(cubes.Size(), 0);
    MakeSparse(problem.space, expander, cover, problem.free, work);
    assert(cover.cubes.Size() == cubes.Size());
    cubes = cover.cubes;
}

} // namespace booleq
