// Tautology: does a cover leave no row out. A cover that is unate in an input is a tautology only
// if the cubes without that input are one; six inputs or fewer are settled by a word of rows.
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
    // Drops cubes that cannot help. False when the answer is known, in m_is_tautology; otherwise
    // m_binate holds the inputs that occur.
    bool Reduce(StackPart& part)
    {
        for (;;) {
            m_work.Spend(part.count * m_num_words + 1);
            m_is_tautology = false;
            if (part.count == 0)
                return false;
            uint64_t anyUnate = 0;
            size_t numBinate = 0;
            for (size_t word = 0; word < m_num_words; ++word) {
                const Occurrence occurrence = FindOccurrence(m_space, m_stack, part, word);
                m_binate[word] = occurrence.zeros & occurrence.ones;
                numBinate += CountBits(m_binate[word]);
                anyUnate |= occurrence.zeros ^ occurrence.ones;
            }
            if (anyUnate == 0 && numBinate == 0) {
                m_is_tautology = true;
                return false;
            }
            if (anyUnate == 0)
                return !Settle(part, numBinate);
            DropUnate(part);
        }
    }

    // Drops the cubes that fix an input that is not binate.
    void DropUnate(StackPart& part)
    {
        size_t count = 0;
        for (size_t index = part.first; index < part.first + part.count; ++index) {
            const uint64_t* cube = m_stack.At(index);
            uint64_t fixed = 0;
            for (size_t word = 0; word < m_num_words; ++word)
                fixed |= ~cube[word] & ~(m_binate[word] * 3);
            if (fixed == 0)
                CopyCube(m_stack.At(part.first + count++), cube, m_num_words);
        }
        assert(count < part.count);
        part.count = count;
    }

    // True when the answer is known: a cube without literals, too few rows, or few inputs.
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
        if (share < 0.999) // short of 1 by more than rounding can take
            return true;
        if (numBinate > kWordInputs)
            return false;
        m_is_tautology = CountRows(part);
        return true;
    }

    bool CountRows(StackPart part) const
    {
        uint64_t covered = 0;
        for (size_t index = part.first; index < part.first + part.count; ++index) {
            uint64_t rows = ~uint64_t(0);
            size_t place = 0;
            for (size_t word = 0; word < m_num_words; ++word) {
                for (uint64_t rest = m_binate[word]; rest != 0; rest &= rest - 1, ++place) {
                    const uint64_t pair = m_stack.At(index)[word] >> LowestBit(rest) & 3;
                    assert(pair != 0);
                    if (pair != 3)
                        rows &= pair == 2 ? BitPattern(place) : ~BitPattern(place);
                }
            }
            covered |= rows;
        }
        return covered == ~uint64_t(0);
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

namespace {

// The same for cubes of one word, which most are: nothing is looked up in the loop.
void AppendMeetingOfWord(const CubeSpace& space, const CubeList& cubes, uint64_t by, size_t left,
                         CubeList& target)
{
    const uint64_t low = space.InputLow(0);
    const uint64_t inputs = space.Inputs(0);
    const uint64_t outputs = space.Outputs(0);
    const uint64_t* const words = cubes.At(0);
    const size_t numCubes = cubes.Size();
    for (size_t index = 0; index < numCubes; ++index) {
        const uint64_t common = words[index] & by;
        if ((low & ~(common | common >> 1)) != 0 || (common & outputs) == 0 || index == left)
            continue;
        const uint64_t cofactor = ((words[index] | ~by) & inputs) | (common & outputs);
        target.Append(&cofactor);
    }
}

} // namespace

void AppendMeeting(const CubeSpace& space, const CubeList& cubes, const uint64_t* by, size_t left,
                   CubeList& target)
{
    if (space.NumWords() == 1) {
        AppendMeetingOfWord(space, cubes, by[0], left, target);
        return;
    }
    for (size_t index = 0; index < cubes.Size(); ++index) {
        const uint64_t* cube = cubes.At(index);
        if (index == left || IsDisjoint(space, cube, by))
            continue;
        target.Resize(target.Size() + 1);
        uint64_t* cofactor = target.At(target.Size() - 1);
        for (size_t word = 0; word < space.NumWords(); ++word)
            cofactor[word] = ((cube[word] | ~by[word]) & space.Inputs(word)) |
                             (cube[word] & by[word] & space.Outputs(word));
    }
}

void AppendOfOutput(const CubeSpace& space, const CubeList& cubes, size_t output, CubeList& target)
{
    assert(target.NumWords() == space.NumInputWords());
    const size_t bit = space.OutputBit(output);
    for (size_t index = 0; index < cubes.Size(); ++index) {
        if (!GetBit(cubes.At(index), bit))
            continue;
        target.Resize(target.Size() + 1);
        for (size_t word = 0; word < space.NumInputWords(); ++word)
            target.At(target.Size() - 1)[word] = cubes.At(index)[word] | ~space.Inputs(word);
    }
}

bool IsTautology(const CubeSpace& space, CubeList& cubes, Work& work)
{
    assert(cubes.NumWords() == space.NumInputWords());
    return TautologyCheck(space, cubes, work).Check({0, cubes.Size()});
}

bool IsCovered(const CubeSpace& space, const uint64_t* cube, const CubeList& first, size_t left,
               const CubeList& second, Work& work)
{
    CubeList meeting(space.NumWords());
    work.Spend((first.Size() + second.Size()) * space.NumWords());
    AppendMeeting(space, first, cube, left, meeting);
    AppendMeeting(space, second, cube, second.Size(), meeting);
    CubeList ofOutput(space.NumInputWords());
    for (size_t output = 0; output < space.NumOutputs(); ++output) {
        if (!GetBit(cube, space.OutputBit(output)))
            continue;
        ofOutput.Resize(0);
        work.Spend(meeting.Size());
        AppendOfOutput(space, meeting, output, ofOutput);
        if (!IsTautology(space, ofOutput, work))
            return false;
    }
    return true;
}

} // namespace booleq
