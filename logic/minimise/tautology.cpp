// Tautology: whether a cover leaves no row out. A cover that is unate in an input is a tautology
// only if the cubes without that input are one; a word of rows settles six inputs or fewer.
#include "small_cover.h"
#include "unate.h"
#include "unate_walk.h"

namespace booleq {

namespace {

class TautologyCheck {
  public:
    TautologyCheck(const CubeSpace& space, CubeList& stack, Work& work)
        : m_space(space), m_stack(stack), m_work(work), m_num_words(space.NumInputWords()),
          m_binate(m_num_words)
    {
    }

    // Depth: one level for each input.
    bool Check(StackPart part)
    {
        if (!Reduce(part))
            return m_is_tautology;
        assert(part.count > 1); // an input is fixed both ways
        const size_t bit = ChooseInput(m_space, m_stack, part, m_binate.data(), m_counts);
        for (const bool value : {false, true}) {
            const StackPart half = PushCofactor(m_stack, part, bit, value);
            const bool isTautology = Check(half);
            m_stack.Resize(half.first);
            if (!isTautology)
                return false;
        }
        return true;
    }

  private:
    // Drops cubes that cannot help. False if the answer is known and in m_is_tautology; otherwise
    // m_binate holds the inputs that occur.
    bool Reduce(StackPart& part)
    {
        for (;;) {
            m_work.Spend(part.count * m_num_words + 1);
            m_is_tautology = false;
            if (part.count == 0)
                return false;
            const UnateCount count = FindBinate(m_space, m_stack, part, m_binate);
            if (!count.hasUnate && count.numBinate == 0) {
                m_is_tautology = true;
                return false;
            }
            if (!count.hasUnate)
                return !Settle(part, count.numBinate);
            DropUnate(m_stack, part, m_binate, nullptr);
        }
    }

    // True if the answer is known: a cube without literals, too few rows, or few inputs.
    bool Settle(StackPart part, size_t numBinate)
    {
        double share = 0; // of all rows, counted as if no two cubes met
        for (size_t index = part.first; index < part.first + part.count; ++index) {
            size_t numLiterals = 0;
            for (size_t word = 0; word < m_num_words; ++word)
                numLiterals += CountBits(~m_stack.At(index)[word]);
            if (numLiterals == 0) {
                m_is_tautology = true;
                return true;
            }
            share +=
                numLiterals < 64 ? 1.0 / static_cast<double>(uint64_t(1) << numLiterals) : 1e-19;
        }
        if (share < 0.999) // further below 1 than rounding can explain
            return true;
        if (numBinate > kWordInputs)
            return false;
        WordRows rows;
        rows.SetInputs(m_binate);
        m_is_tautology = rows.Covered(m_stack, part) == ~uint64_t(0);
        return true;
    }

    const CubeSpace& m_space;
    CubeList& m_stack;
    Work& m_work;
    size_t m_num_words;
    std::vector<uint64_t> m_binate;
    std::vector<uint32_t> m_counts;
    bool m_is_tautology = false;
};

} // namespace

bool IsTautology(const CubeSpace& space, CubeList& cubes, Work& work)
{
    assert(cubes.NumWords() == space.NumInputWords());
    work.Spend(cubes.Size() * cubes.NumWords() + 1);
    if (cubes.IsEmpty()) // the most frequent answers
        return false;
    if (HasUniversal(cubes, {0, cubes.Size()}))
        return true;
    return TautologyCheck(space, cubes, work).Check({0, cubes.Size()});
}

} // namespace booleq
