// One row that a cover leaves out.
#include "cofactors.h"
#include "unate.h"
#include "unate_walk.h"

namespace booleq {

namespace {

class RowSearch {
  public:
    RowSearch(const CubeSpace& space, CubeList& stack, Work& work, uint64_t* row)
        : m_space(space), m_stack(stack), m_work(work), m_num_words(space.NumInputWords()),
          m_row(row), m_binate(m_num_words)
    {
    }

    // Narrows m_row to values for which a row is left out; inputs that it still leaves open do not
    // matter.  Fails: false if no row is left out.  Depth: one level for each input.
    bool Find(StackPart part)
    {
        const std::vector<uint64_t> before(m_row, m_row + m_num_words);
        for (;;) {
            m_work.Spend(part.count * m_num_words + 1);
            if (part.count == 0)
                return true;
            uint64_t anyUnate = 0;
            size_t numBinate = 0;
            for (size_t word = 0; word < m_num_words; ++word) {
                const Occurrence occurrence = FindOccurrence(m_space, m_stack, part, word);
                m_binate[word] = occurrence.zeros & occurrence.ones;
                numBinate += CountBits(m_binate[word]);
                const uint64_t onlyZeros = occurrence.zeros & ~occurrence.ones;
                const uint64_t onlyOnes = occurrence.ones & ~occurrence.zeros;
                m_row[word] &= ~onlyZeros & ~(onlyOnes << 1); // the value that covers less
                anyUnate |= onlyZeros | onlyOnes;
            }
            if (HasUniversal(m_stack, part) || (anyUnate == 0 && numBinate == 0)) {
                CopyCube(m_row, before.data(), m_num_words);
                return false;
            }
            if (anyUnate == 0)
                break;
            DropUnate(m_stack, part, m_binate, nullptr);
        }
        const size_t bit = ChooseInput(m_space, m_stack, part, m_binate.data(), m_counts);
        for (const bool value : {false, true}) {
            const StackPart half = PushCofactor(m_stack, part, bit, value);
            ClearBit(m_row, value ? bit : bit + 1);
            const bool isFound = Find(half);
            m_stack.Resize(half.first);
            if (isFound)
                return true;
            SetBit(m_row, value ? bit : bit + 1);
        }
        CopyCube(m_row, before.data(), m_num_words);
        return false;
    }

  private:
    const CubeSpace& m_space;
    CubeList& m_stack;
    Work& m_work;
    size_t m_num_words;
    uint64_t* m_row;
    std::vector<uint64_t> m_binate;
    std::vector<uint32_t> m_counts;
};

} // namespace

UncoveredRows::UncoveredRows(const CubeSpace& space, const uint64_t* cube, const CubeList& cubes,
                             Work& work)
    : m_space(space), m_work(work), m_cube(cube, cube + space.NumWords()),
      m_meeting(space.NumWords()), m_of_output(space.NumInputWords())
{
    work.Spend(cubes.Size() * space.NumWords());
    for (size_t index = 0; index < cubes.Size(); ++index)
        if (!IsDisjoint(space, cubes.At(index), cube))
            AppendCofactor(space, cubes.At(index), cube, m_meeting);
    ListOutput();
}

void UncoveredRows::ListOutput()
{
    while (m_output < m_space.NumOutputs() && !GetBit(m_cube.data(), m_space.OutputBit(m_output)))
        ++m_output;
    m_of_output.Resize(0);
    if (m_output < m_space.NumOutputs())
        AppendOfOutput(m_space, m_meeting, m_output, m_of_output);
}

void UncoveredRows::Cover(const uint64_t* cube)
{
    if (IsDisjoint(m_space, cube, m_cube.data()))
        return;
    AppendCofactor(m_space, cube, m_cube.data(), m_meeting);
    if (m_output == m_space.NumOutputs() || !GetBit(cube, m_space.OutputBit(m_output)))
        return;
    m_of_output.Append(m_meeting.At(m_meeting.Size() - 1)); // only its inputs
    uint64_t* const inputs = m_of_output.At(m_of_output.Size() - 1);
    for (size_t word = 0; word < m_space.NumInputWords(); ++word)
        inputs[word] |= ~m_space.Inputs(word);
}

bool UncoveredRows::Next(uint64_t* row)
{
    for (; m_output < m_space.NumOutputs(); ++m_output, ListOutput()) {
        for (size_t word = 0; word < m_space.NumWords(); ++word)
            row[word] = m_cube[word] & m_space.Inputs(word);
        CubeList stack = m_of_output; // the search drops cubes from it
        if (!RowSearch(m_space, stack, m_work, row).Find({0, stack.Size()}))
            continue;
        for (size_t input = 0; input < m_space.NumInputs(); ++input)
            if (GetBit(row, 2 * input) && GetBit(row, 2 * input + 1))
                ClearBit(row, 2 * input + 1);
        SetBit(row, m_space.OutputBit(m_output));
        assert(Contains(m_cube.data(), row, m_space.NumWords()));
        assert(CountCubeLiterals(m_space, row) == m_space.NumInputs());
        return true;
    }
    return false;
}

} // namespace booleq
