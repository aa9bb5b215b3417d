#include "cover.h"

#include <cassert>
#include <utility>

#include "watch.h"

namespace booleq {

namespace {

class CoverSearch {
  public:
    explicit CoverSearch(unsigned int numInputs) : m_num_inputs(numInputs) {}

    // Takes the first input off, again and again: adds products over the inputs left that cover
    // 'needed' and nothing outside 'allowed', each with what 'prefix' says of the inputs before.
    // Gives back what they cover. The depth is the number of inputs.
    Rows Find(const Rows& needed, const Rows& allowed, Cube prefix)
    {
        Watch();
        assert(IsZero(AndNot(needed, allowed)));
        if (IsZero(needed))
            return Rows(needed.NumInputs());
        if (IsOne(allowed)) {
            m_cubes.push_back(prefix);
            return allowed;
        }
        const uint32_t input = uint32_t(1) << (m_num_inputs - needed.NumInputs());
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

    std::vector<Cube> Take() { return std::move(m_cubes); }

  private:
    unsigned int m_num_inputs;
    std::vector<Cube> m_cubes;
};

} // namespace

std::vector<Cube> FindCover(const Rows& function)
{
    assert(function.NumInputs() <= kMaxCoverInputs);
    CoverSearch search(function.NumInputs());
    const Rows covered = search.Find(function, function, {0, 0});
    assert(covered == function);
    (void)covered;
    return search.Take();
}

size_t CountLiterals(const std::vector<Cube>& cubes)
{
    size_t count = 0;
    for (const Cube& cube : cubes)
        count += static_cast<size_t>(__builtin_popcount(cube.used));
    return count;
}

} // namespace booleq
