// What the rows that a cover leaves out have in common: the supercube of the complement, without
// the complement itself. A subtree is entered only for parts that have not been found yet.
#include "small_cover.h"
#include "unate.h"
#include "unate_walk.h"

namespace booleq {

namespace {

class UncoveredSearch {
  public:
    UncoveredSearch(const CubeSpace& space, CubeList& stack, Work& work, uint64_t* found)
        : m_space(space), m_stack(stack), m_work(work), m_num_words(space.NumInputWords()),
          m_found(found), m_path(m_num_words, ~uint64_t(0)), m_binate(m_num_words),
          m_unate(m_num_words)
    {
    }

    // Depth: one level for each input.
    void Find(StackPart part)
    {
        m_work.Spend(2 * part.count * m_num_words + 1);
        if (!HasNews())
            return;
        if (part.count == 0) {
            for (size_t word = 0; word < m_num_words; ++word)
                m_found[word] |= m_path[word];
            return;
        }
        if (HasUniversal(m_stack, part))
            return;
        size_t numActive = 0;
        size_t unateBit = SIZE_MAX;
        bool isUnateOne = false;
        for (size_t word = 0; word < m_num_words; ++word) {
            const Occurrence occurrence = FindOccurrence(m_space, m_stack, part, word);
            m_binate[word] = occurrence.zeros & occurrence.ones;
            m_unate[word] = occurrence.zeros ^ occurrence.ones;
            numActive += CountBits(occurrence.zeros | occurrence.ones);
            if (m_unate[word] != 0 && unateBit == SIZE_MAX) {
                unateBit = 64 * word + LowestBit(m_unate[word]);
                isUnateOne = GetBit(&occurrence.ones, unateBit % 64);
            }
        }
        if (numActive <= kWordInputs)
            AddRows(part);
        else if (unateBit != SIZE_MAX)
            SplitUnate(part, unateBit, isUnateOne);
        else
            Split(part, ChooseInput(m_space, m_stack, part, m_binate.data(), m_counts));
    }

  private:
    // Whether rows on this path could have a part that has not been found yet.
    bool HasNews() const
    {
        for (size_t word = 0; word < m_num_words; ++word)
            if ((m_path[word] & ~m_found[word]) != 0)
                return true;
        return false;
    }

    void Enter(StackPart part, size_t lowBit, bool value)
    {
        const StackPart half = PushCofactor(m_stack, part, lowBit, value);
        ClearBit(m_path.data(), value ? lowBit : lowBit + 1);
        Find(half);
        SetBit(m_path.data(), value ? lowBit : lowBit + 1);
        m_stack.Resize(half.first);
    }

    void Split(StackPart part, size_t lowBit)
    {
        Enter(part, lowBit, false);
        Enter(part, lowBit, true);
    }

    // Rows that are left out for the value where more is covered are left out for the other value
    // too: all that they can add is that value of the input itself.
    void SplitUnate(StackPart part, size_t lowBit, bool isOne)
    {
        Enter(part, lowBit, !isOne);
        const size_t moreBit = isOne ? lowBit + 1 : lowBit;
        if (GetBit(m_found, moreBit))
            return;
        const StackPart half = PushCofactor(m_stack, part, lowBit, isOne);
        CubeList copy(m_num_words);
        for (size_t index = half.first; index < half.first + half.count; ++index)
            copy.Append(m_stack.At(index));
        m_stack.Resize(half.first);
        if (!IsTautology(m_space, copy, m_work))
            SetBit(m_found, moreBit);
    }

    void AddRows(StackPart part)
    {
        std::vector<uint64_t>& inputs = m_binate; // no longer needed
        for (size_t word = 0; word < m_num_words; ++word)
            inputs[word] |= m_unate[word];
        WordRows rows;
        rows.SetInputs(inputs);
        const uint64_t covered = rows.Covered(m_stack, part);
        if (covered == ~uint64_t(0))
            return;
        std::vector<uint64_t>& parts = m_unate; // nor is this
        parts = m_path;
        for (size_t place = 0; place < rows.NumInputs(); ++place) {
            if ((~covered & BitPattern(place)) == 0)
                ClearBit(parts.data(), rows.LowBit(place) + 1);
            if ((~covered & ~BitPattern(place)) == 0)
                ClearBit(parts.data(), rows.LowBit(place));
        }
        for (size_t word = 0; word < m_num_words; ++word)
            m_found[word] |= parts[word];
    }

    const CubeSpace& m_space;
    CubeList& m_stack;
    Work& m_work;
    size_t m_num_words;
    uint64_t* m_found;
    std::vector<uint64_t> m_path; // parts left by the inputs fixed so far
    std::vector<uint64_t> m_binate;
    std::vector<uint64_t> m_unate;
    std::vector<uint32_t> m_counts;
};

} // namespace

void AddUncovered(const CubeSpace& space, CubeList& cubes, Work& work, uint64_t* found)
{
    assert(cubes.NumWords() == space.NumInputWords());
    UncoveredSearch(space, cubes, work, found).Find({0, cubes.Size()});
}

} // namespace booleq
