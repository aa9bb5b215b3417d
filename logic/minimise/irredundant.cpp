// IRREDUNDANT and ESSENTIAL PRIMES. Which cubes a cover can do without is a covering problem: its
// rows are found where the recursion of a tautology check ends, as sets of cubes one of which must
// stay.
#include <algorithm>
#include <numeric>

#include "covering.h"
#include "reduce.h"
#include "unate.h"
#include "unate_walk.h"

namespace booleq {

namespace {

constexpr uint64_t kIrredundantUnits = 1u << 22; // to choose cubes in; each row has a cube anyway
constexpr uint32_t kFixed = UINT32_MAX;          // label of cubes that stay

// Appends a row for each place that only labelled cubes cover.
class ChoiceSearch {
  public:
    ChoiceSearch(const CubeSpace& space, Work& work, std::vector<std::vector<uint32_t>>& rows)
        : m_space(space), m_work(work), m_num_words(space.NumInputWords()), m_stack(m_num_words),
          m_binate(m_num_words), m_rows(rows)
    {
    }

    // Requires: the cubes cover all rows. Takes them as the walk's stack.
    void Find(CubeList& cubes, std::vector<uint32_t>& labels)
    {
        assert(cubes.Size() == labels.size());
        std::swap(m_stack, cubes);
        m_labels.swap(labels);
        Find(StackPart{0, m_stack.Size()});
    }

  private:
    // Depth: one level for each input.
    void Find(StackPart part)
    {
        size_t numBinate = 0;
        for (;;) {
            m_work.Spend(2 * part.count * m_num_words + 1);
            uint64_t anyUnate = 0;
            numBinate = 0;
            for (size_t word = 0; word < m_num_words; ++word) {
                const Occurrence occurrence = FindOccurrence(m_space, m_stack, part, word);
                m_binate[word] = occurrence.zeros & occurrence.ones;
                numBinate += CountBits(m_binate[word]);
                anyUnate |= occurrence.zeros ^ occurrence.ones;
            }
            if (anyUnate == 0)
                break;
            // Where an input that is unate has its worse value, fewer cubes are left: the rows
            // found there imply those elsewhere.
            DropUnate(part);
        }
        assert(part.count > 0); // the cubes cover this place
        std::vector<uint32_t> universal;
        for (size_t index = part.first; index < part.first + part.count; ++index) {
            if (!IsUniversal(m_stack.At(index), m_num_words))
                continue;
            if (m_labels[index] == kFixed)
                return;
            universal.push_back(m_labels[index]);
        }
        if (numBinate == 0) {
            std::sort(universal.begin(), universal.end());
            m_rows.push_back(std::move(universal));
            return;
        }
        const size_t bit = ChooseInput(m_space, m_stack, part, m_binate.data(), m_counts);
        for (const bool value : {false, true}) {
            Find(PushLabelled(part, bit, value));
            m_stack.Resize(part.first + part.count);
            m_labels.resize(part.first + part.count);
        }
    }

    void DropUnate(StackPart& part)
    {
        size_t count = 0;
        for (size_t index = part.first; index < part.first + part.count; ++index) {
            const uint64_t* cube = m_stack.At(index);
            uint64_t fixed = 0;
            for (size_t word = 0; word < m_num_words; ++word)
                fixed |= ~cube[word] & ~(m_binate[word] * 3);
            if (fixed != 0)
                continue;
            m_labels[part.first + count] = m_labels[index];
            CopyCube(m_stack.At(part.first + count++), cube, m_num_words);
        }
        part.count = count;
        m_stack.Resize(part.first + count);
        m_labels.resize(part.first + count);
    }

    StackPart PushLabelled(StackPart part, size_t bit, bool value)
    {
        for (size_t index = part.first; index < part.first + part.count; ++index)
            if (GetBit(m_stack.At(index), value ? bit + 1 : bit))
                m_labels.push_back(m_labels[index]);
        const StackPart half = PushCofactor(m_stack, part, bit, value);
        assert(m_labels.size() == m_stack.Size());
        return half;
    }

    const CubeSpace& m_space;
    Work& m_work;
    size_t m_num_words;
    CubeList m_stack;
    std::vector<uint32_t> m_labels; // one for each cube of the stack
    std::vector<uint64_t> m_binate;
    std::vector<uint32_t> m_counts;
    std::vector<std::vector<uint32_t>>& m_rows;
};

// AppendMeeting with the label of each cube; without labels all are fixed.
void AppendLabelled(const CubeSpace& space, const CubeList& cubes, const uint64_t* by, bool isFixed,
                    CubeList& meeting, std::vector<uint32_t>& labels)
{
    for (size_t index = 0; index < cubes.Size(); ++index)
        if (!IsDisjoint(space, cubes.At(index), by))
            labels.push_back(isFixed ? kFixed : static_cast<uint32_t>(index));
    AppendMeeting(space, cubes, by, cubes.Size(), meeting);
    assert(meeting.Size() == labels.size());
}

// The rows of the covering problem whose columns are the cubes of 'choices'; 'fixed' stay.
std::vector<std::vector<uint32_t>> FindChoices(const CubeSpace& space, const CubeList& choices,
                                               const CubeList& fixed, Work& work)
{
    std::vector<std::vector<uint32_t>> rows;
    for (size_t index = 0; index < choices.Size(); ++index) {
        const size_t numBefore = rows.size();
        CubeList meeting(space.NumWords());
        std::vector<uint32_t> meetingLabels;
        work.Spend((choices.Size() + fixed.Size()) * space.NumWords());
        AppendLabelled(space, choices, choices.At(index), false, meeting, meetingLabels);
        AppendLabelled(space, fixed, choices.At(index), true, meeting, meetingLabels);
        for (size_t output = 0; output < space.NumOutputs(); ++output) {
            if (!GetBit(choices.At(index), space.OutputBit(output)))
                continue;
            CubeList cubes(space.NumInputWords());
            std::vector<uint32_t> labels;
            AppendOfOutput(space, meeting, output, cubes);
            for (size_t place = 0; place < meeting.Size(); ++place)
                if (GetBit(meeting.At(place), space.OutputBit(output)))
                    labels.push_back(meetingLabels[place]);
            ChoiceSearch(space, work, rows).Find(cubes, labels);
        }
        std::sort(rows.begin() + static_cast<std::ptrdiff_t>(numBefore), rows.end());
        rows.erase(std::unique(rows.begin() + static_cast<std::ptrdiff_t>(numBefore), rows.end()),
                   rows.end());
    }
    std::sort(rows.begin(), rows.end());
    rows.erase(std::unique(rows.begin(), rows.end()), rows.end());
    return rows;
}

} // namespace

void MakeIrredundant(const CubeSpace& space, Cover& cover, const CubeList& free, Work& work)
{
    CubeList& cubes = cover.cubes;
    std::vector<uint8_t> isKept(cubes.Size(), 0);
    CubeList fixed = free; // and the cubes that have a place of their own
    for (size_t index = 0; index < cubes.Size(); ++index) {
        if (!IsCovered(space, cubes.At(index), cubes, index, free, work)) {
            isKept[index] = 1;
            fixed.Append(cubes.At(index));
        }
    }
    CubeList choices(space.NumWords());
    std::vector<uint32_t> places;
    const CubeList none(space.NumWords());
    for (size_t index = 0; index < cubes.Size(); ++index) {
        if (isKept[index] == 0 &&
            !IsCovered(space, cubes.At(index), fixed, fixed.Size(), none, work)) {
            choices.Append(cubes.At(index));
            places.push_back(static_cast<uint32_t>(index));
        }
    }
    if (!choices.IsEmpty()) {
        CoveringProblem problem;
        problem.rows = FindChoices(space, choices, fixed, work);
        const uint64_t costOfCube = CountLiterals(space, choices) + 1;
        for (size_t index = 0; index < choices.Size(); ++index)
            problem.costs.push_back(costOfCube + CountCubeLiterals(space, choices.At(index)));
        for (const uint32_t choice : SolveCovering(problem, kIrredundantUnits, work).columns)
            isKept[places[choice]] = 1;
    }
    cubes.Keep(isKept);
    size_t numKept = 0;
    for (size_t index = 0; index < isKept.size(); ++index)
        if (isKept[index] != 0)
            cover.isPrime[numKept++] = cover.isPrime[index];
    cover.isPrime.resize(numKept);
}

namespace {

// The cubes whose part outside 'prime' has a consensus with it: as cofactors with respect to
// 'prime', with the outputs for which it is one.
void AppendConsensus(const CubeSpace& space, const CubeList& cubes, size_t left,
                     const uint64_t* prime, CubeList& target)
{
    for (size_t index = 0; index < cubes.Size(); ++index) {
        const uint64_t* cube = cubes.At(index);
        size_t distance = 0;
        uint64_t outside = 0;
        for (size_t word = 0; word < space.NumInputWords() && distance <= 1; ++word) {
            const uint64_t conflicts = InputConflicts(space, cube, prime, word);
            distance += (conflicts != 0 ? 1u : 0u) + ((conflicts & (conflicts - 1)) != 0 ? 1u : 0u);
            outside |= cube[word] & ~prime[word] & space.Inputs(word);
        }
        if (index == left || distance > 1)
            continue;
        uint64_t outputsOutside = 0;
        for (size_t word = space.FirstOutputWord(); word < space.NumWords(); ++word)
            outputsOutside |= cube[word] & ~prime[word] & space.Outputs(word);
        const bool isForAll = distance == 0 && outputsOutside != 0;
        if (!isForAll && (outside == 0 || !HasCommonOutput(space, cube, prime)))
            continue;
        target.Resize(target.Size() + 1);
        uint64_t* consensus = target.At(target.Size() - 1);
        for (size_t word = 0; word < space.NumWords(); ++word)
            consensus[word] = ((cube[word] | ~prime[word]) & space.Inputs(word)) |
                              InputConflicts(space, cube, prime, word) * 3 |
                              ((isForAll ? ~uint64_t(0) : cube[word]) & space.Outputs(word));
    }
}

} // namespace

std::vector<uint8_t> FindEssential(const CubeSpace& space, const CubeList& cubes,
                                   const CubeList& free, Work& work)
{
    std::vector<uint8_t> isEssential(cubes.Size(), 0);
    for (size_t index = 0; index < cubes.Size(); ++index) {
        const uint64_t* prime = cubes.At(index);
        CubeList consensus(space.NumWords());
        work.Spend(2 * (cubes.Size() + free.Size()) * space.NumWords());
        AppendMeeting(space, free, prime, free.Size(), consensus);
        AppendConsensus(space, cubes, index, prime, consensus);
        AppendConsensus(space, free, free.Size(), prime, consensus);
        for (size_t output = 0; output < space.NumOutputs() && isEssential[index] == 0; ++output) {
            if (!GetBit(prime, space.OutputBit(output)))
                continue;
            CubeList ofOutput(space.NumInputWords());
            work.Spend(consensus.Size());
            AppendOfOutput(space, consensus, output, ofOutput);
            if (!IsTautology(space, ofOutput, work))
                isEssential[index] = 1;
        }
    }
    return isEssential;
}

} // namespace booleq
