#include "cover.h"

#include <cassert>
#include <utility>

#include "watch.h"

namespace booleq {

namespace {

constexpr unsigned int kMaxWordInputs = 6;

// Products that are kept, or only counted.
struct CubeKeeper {
    void Add(Cube cube) { cubes.push_back(cube); }
    std::vector<Cube> cubes;
};
struct LiteralCounter {
    void Add(Cube cube) { count += static_cast<size_t>(__builtin_popcount(cube.used)); }
    size_t count = 0;
};

template <class Sink>
class CoverSearch {
  public:
    CoverSearch(unsigned int numInputs, Sink& sink) : m_num_inputs(numInputs), m_sink(sink) {}

    // Takes the first input off, again and again: adds products over the inputs left that cover
    // 'needed' and nothing outside 'allowed', each with what 'prefix' says of the inputs before.
    // Gives back what they cover. The depth is the number of inputs.
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

    // The same in one word: 'numInputs' inputs are left.
    uint64_t FindInWord(uint64_t needed, uint64_t allowed, unsigned int numInputs, Cube prefix)
    {
        assert((needed & ~allowed) == 0);
        if (needed == 0)
            return 0;
        if (allowed == RowMask(numInputs)) {
            m_sink.Add(prefix);
            return allowed;
        }
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

    unsigned int m_num_inputs;
    Sink& m_sink;
};

template <class Sink>
void Search(const Rows& function, Sink& sink)
{
    assert(function.NumInputs() <= kMaxCoverInputs);
    const Rows covered =
        CoverSearch<Sink>(function.NumInputs(), sink).Find(function, function, {0, 0});
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
