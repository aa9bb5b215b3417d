#include "cover.h"

#include <algorithm>
#include <array>
#include <cassert>
#include <utility>

#include "watch.h"

namespace booleq {

namespace {

constexpr unsigned int kMaxWordInputs = 6;

// Where the products go: they are kept, or only their literals are counted.
struct CubeKeeper {
    void Add(Cube cube) { cubes.push_back(cube); }
    std::vector<Cube> cubes;
};
struct LiteralCounter {
    void Add(Cube cube) { count += static_cast<size_t>(__builtin_popcount(cube.used)); }
    size_t count = 0;
};

// A table of what the search finds for the last inputs, by the rows needed and allowed: most of its
// steps would be there.
constexpr unsigned int kNumLastInputs = 2;
constexpr size_t kNumLastFunctions = 16;
struct LastCover {
    uint64_t covered = 0;
    size_t numCubes = 0;
    std::array<Cube, 2> cubes = {}; // of inputs 0 and 1, the last two
};
typedef std::array<std::array<LastCover, kNumLastFunctions>, kNumLastFunctions> LastCovers;

template <class Sink>
class CoverSearch {
  public:
    // 'lastCovers' may be null.
    CoverSearch(unsigned int numInputs, const LastCovers* lastCovers, Sink& sink)
        : m_num_inputs(numInputs), m_last_covers(lastCovers), m_sink(sink)
    {
    }

    // Takes off the first input, again and again: adds products over the inputs left that cover
    // 'needed' and nothing outside 'allowed', each joined with the literals in 'prefix'. Returns
    // the rows that they cover. The depth is the number of inputs.
    Rows Find(const Rows& needed, const Rows& allowed, Cube prefix)
    {
        Watch();
        if (needed.NumInputs() <= kMaxWordInputs)
            return Rows::OfWord(
                needed.NumInputs(),
                FindInWord(needed.Words()[0], allowed.Words()[0], needed.NumInputs(), prefix));
        assert(IsZero(AndNot(needed, allowed)));
        if (IsZero(needed))
            return Rows(needed.NumInputs());
        if (IsOne(allowed)) {
            m_sink.Add(prefix);
            return allowed;
        }
        const uint32_t input = InputOf(needed.NumInputs());
        const Rows needed0 = Half(needed, false);
        const Rows needed1 = Half(needed, true);
        const Rows allowed0 = Half(allowed, false);
        const Rows allowed1 = Half(allowed, true);
        const Rows covered0 =
            Find(AndNot(needed0, allowed1), allowed0, {prefix.used | input, prefix.values});
        const Rows covered1 =
            Find(AndNot(needed1, allowed0), allowed1, {prefix.used | input, prefix.values | input});
        const Rows both = Find(AndNot(needed0, covered0) | AndNot(needed1, covered1),
                               allowed0 & allowed1, prefix);
        return JoinHalves(covered0 | both, covered1 | both);
    }

    // The same within one word: 'numInputs' inputs are left.
    uint64_t FindInWord(uint64_t needed, uint64_t allowed, unsigned int numInputs, Cube prefix)
    {
        assert((needed & ~allowed) == 0);
        if (needed == 0)
            return 0;
        if (allowed == RowMask(numInputs)) {
            m_sink.Add(prefix);
            return allowed;
        }
        if (numInputs == kNumLastInputs && m_last_covers != nullptr)
            return AddLast(
                (*m_last_covers)[static_cast<size_t>(needed)][static_cast<size_t>(allowed)],
                prefix);
        assert(numInputs > 0); // a single row is either all or nothing
        const uint32_t input = InputOf(numInputs);
        const unsigned int numRows = 1u << (numInputs - 1); // of a half
        const uint64_t half = RowMask(numInputs - 1);
        const uint64_t needed0 = needed & half;
        const uint64_t needed1 = needed >> numRows;
        const uint64_t allowed0 = allowed & half;
        const uint64_t allowed1 = allowed >> numRows;
        const uint64_t covered0 = FindInWord(needed0 & ~allowed1, allowed0, numInputs - 1,
                                             {prefix.used | input, prefix.values});
        const uint64_t covered1 = FindInWord(needed1 & ~allowed0, allowed1, numInputs - 1,
                                             {prefix.used | input, prefix.values | input});
        const uint64_t both = FindInWord((needed0 & ~covered0) | (needed1 & ~covered1),
                                         allowed0 & allowed1, numInputs - 1, prefix);
        return covered0 | both | (covered1 | both) << numRows;
    }

  private:
    // The first of the last 'numInputs' inputs, as a set.
    uint32_t InputOf(unsigned int numInputs) const
    {
        return uint32_t(1) << (m_num_inputs - numInputs);
    }

    uint64_t AddLast(const LastCover& cover, Cube prefix)
    {
        const unsigned int numBefore = m_num_inputs - kNumLastInputs;
        for (size_t place = 0; place < cover.numCubes; ++place) {
            const Cube cube = cover.cubes[place];
            m_sink.Add(
                {prefix.used | cube.used << numBefore, prefix.values | cube.values << numBefore});
        }
        return cover.covered;
    }

    unsigned int m_num_inputs;
    const LastCovers* m_last_covers;
    Sink& m_sink;
};

LastCovers MakeLastCovers()
{
    LastCovers covers;
    for (size_t allowed = 0; allowed < kNumLastFunctions; ++allowed) {
        for (size_t needed = 0; needed < kNumLastFunctions; ++needed) {
            if ((needed & ~allowed) != 0)
                continue;
            CubeKeeper keeper;
            LastCover& cover = covers[needed][allowed];
            cover.covered = CoverSearch<CubeKeeper>(kNumLastInputs, nullptr, keeper)
                                .FindInWord(needed, allowed, kNumLastInputs, {0, 0});
            cover.numCubes = keeper.cubes.size();
            assert(cover.numCubes <= cover.cubes.size());
            std::copy(keeper.cubes.begin(), keeper.cubes.end(), cover.cubes.begin());
        }
    }
    return covers;
}

template <class Sink>
void Search(const Rows& function, Sink& sink)
{
    assert(function.NumInputs() <= kMaxCoverInputs);
    static const LastCovers lastCovers = MakeLastCovers();
    const Rows covered =
        CoverSearch<Sink>(function.NumInputs(), &lastCovers, sink).Find(function, function, {0, 0});
    assert(covered == function);
    (void)covered;
}

} // namespace

std::vector<Cube> FindCover(const Rows& function)
{
    CubeKeeper keeper;
    Search(function, keeper);
    return std::move(keeper.cubes);
}

size_t CountCoverLiterals(const Rows& function)
{
    LiteralCounter counter;
    Search(function, counter);
    return counter.count;
}

size_t CountLiterals(const std::vector<Cube>& cubes)
{
    size_t count = 0;
    for (const Cube& cube : cubes)
        count += static_cast<size_t>(__builtin_popcount(cube.used));
    return count;
}

} // namespace booleq
