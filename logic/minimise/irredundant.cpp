// IRREDUNDANT and ESSENTIAL PRIMES. Which cubes a cover can do without is a covering problem: its
// rows are found at the leaves of a tautology check, as sets of cubes one of which must stay.
#include <algorithm>
#include <numeric>

#include "cofactors.h"
#include "covering.h"
#include "reduce.h"
#include "unate.h"
#include "unate_walk.h"

namespace booleq {

namespace {

constexpr uint64_t kIrredundantUnits = 1u << 20; // to choose cubes in; the choice always covers
// Overlapping cubes can have more choices than there are rows; then none is made.
constexpr uint64_t kChoiceUnits = uint64_t(1) << 23;
constexpr uint32_t kFixed = UINT32_MAX; // label of cubes that stay

// Appends a row for each place that only labelled cubes cover.
class ChoiceSearch {
  public:
    ChoiceSearch(const CubeSpace& space, Work& work, std::vector<std::vector<uint32_t>>& rows)
        : m_space(space), m_work(work), m_num_words(space.NumInputWords()), m_stack(m_num_words),
          m_binate(m_num_words), m_rows(rows)
    {
    }

    // Requires: the cubes cover all rows. They become the stack of the walk.
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
        UnateCount count;
        for (;;) {
            m_work.Spend(2 * part.count * m_num_words + 1);
            count = FindBinate(m_space, m_stack, part, m_binate);
            if (!count.hasUnate)
                break;
            // For the worse value of a unate input fewer cubes are left: the rows found there imply
            // those found elsewhere.
            DropUnate(m_stack, part, m_binate, &m_labels);
            m_stack.Resize(part.first + part.count);
            m_labels.resize(m_stack.Size());
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
        if (count.numBinate == 0) {
            assert(!universal.empty()); // nothing else covers this place
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

// The rows of the covering problem whose columns are the cubes of 'choices'; 'fixed' cubes stay.
std::vector<std::vector<uint32_t>> FindChoices(const CubeSpace& space, const CubeList& choices,
                                               const CubeList& fixed, Work& work)
{
    std::vector<std::vector<uint32_t>> rows;
    CubeIndex choiceIndex(space, choices);
    CubeIndex fixedIndex(space, fixed);
    std::vector<uint32_t> meetingLabels;
    std::vector<uint32_t> found;
    for (size_t index = 0; index < choices.Size(); ++index) {
        const size_t numBefore = rows.size();
        CubeList meeting(space.NumWords());
        choiceIndex.Find(choices.At(index), 0, work, meetingLabels);
        for (const uint32_t choice : meetingLabels)
            AppendCofactor(space, choices.At(choice), choices.At(index), meeting);
        fixedIndex.Find(choices.At(index), 0, work, found);
        for (const uint32_t place : found)
            AppendCofactor(space, fixed.At(place), choices.At(index), meeting);
        meetingLabels.resize(meeting.Size(), kFixed);
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

// The cubes that are left when those with the most literals are dropped first, as long as the
// others cover them.
std::vector<uint32_t> DropInOrder(const CubeSpace& space, CubeList choices, const CubeList& fixed,
                                  Work& work)
{
    std::vector<uint32_t> order(choices.Size());
    std::iota(order.begin(), order.end(), 0u);
    std::stable_sort(order.begin(), order.end(), [&](uint32_t left, uint32_t right) {
        return CountCubeLiterals(space, choices.At(left)) >
               CountCubeLiterals(space, choices.At(right));
    });
    std::vector<uint32_t> kept;
    CubeIndex choiceIndex(space, choices);
    CubeIndex fixedIndex(space, fixed);
    Cofactors ofOthers(space, choiceIndex, fixedIndex, work);
    for (const uint32_t choice : order) {
        if (!ofOthers.Cover(choices.At(choice), choice)) {
            kept.push_back(choice);
            continue;
        }
        std::fill(choices.At(choice), choices.At(choice) + space.NumWords(), 0);
        choiceIndex.Update(choice);
    }
    return kept;
}

// The choices to keep so that they and 'fixed' cover what all of the choices covered.
std::vector<uint32_t> Choose(const CubeSpace& space, const CubeList& choices, const CubeList& fixed,
                             Work& work)
{
    if (choices.IsEmpty())
        return {};
    const uint64_t limit = work.Limit();
    const uint64_t choiceLimit = work.Spent() + kChoiceUnits;
    CoveringProblem problem;
    work.SetLimit(std::min(limit, choiceLimit));
    try {
        problem.rows = FindChoices(space, choices, fixed, work);
    } catch (const OutOfWork& out) {
        work.SetLimit(limit);
        if (out.isTime || limit <= choiceLimit)
            throw;
        return DropInOrder(space, choices, fixed, work);
    }
    work.SetLimit(limit);
    const uint64_t costOfCube = CountLiterals(space, choices) + 1;
    for (size_t index = 0; index < choices.Size(); ++index)
        problem.costs.push_back(costOfCube + CountCubeLiterals(space, choices.At(index)));
    return SolveCovering(problem, kIrredundantUnits, work).columns;
}

} // namespace

void MakeIrredundant(const CubeSpace& space, Cover& cover, const CubeList& free, Work& work)
{
    CubeList& cubes = cover.cubes;
    std::vector<uint8_t> isKept(cubes.Size(), 0);
    CubeList fixed = free; // and the cubes that alone cover some place
    CubeIndex cubeIndex(space, cubes);
    CubeIndex freeIndex(space, free);
    Cofactors ofOthers(space, cubeIndex, freeIndex, work);
    for (size_t index = 0; index < cubes.Size(); ++index) {
        if (!ofOthers.Cover(cubes.At(index), index)) {
            isKept[index] = 1;
            fixed.Append(cubes.At(index));
        }
    }
    CubeList choices(space.NumWords());
    std::vector<uint32_t> places;
    const CubeList none(space.NumWords());
    CubeIndex fixedIndex(space, fixed);
    CubeIndex noIndex(space, none);
    Cofactors ofFixed(space, fixedIndex, noIndex, work);
    for (size_t index = 0; index < cubes.Size(); ++index) {
        if (isKept[index] == 0 && !ofFixed.Cover(cubes.At(index), SIZE_MAX)) {
            choices.Append(cubes.At(index));
            places.push_back(static_cast<uint32_t>(index));
        }
    }
    for (const uint32_t choice : Choose(space, choices, fixed, work)) {
        assert(isKept[places[choice]] == 0);
        isKept[places[choice]] = 1;
    }
    KeepInCover(cover, isKept);
}

namespace {

// Appends the consensus of each cube's part outside 'prime' with it, if there is one: as a cofactor
// with respect to 'prime', with the outputs for which it holds. 'near' lists cubes at most one part
// away.
void AppendConsensus(const CubeSpace& space, const CubeList& cubes,
                     const std::vector<uint32_t>& near, size_t left, const uint64_t* prime,
                     CubeList& target)
{
    for (const uint32_t index : near) {
        if (index == left)
            continue;
        const uint64_t* cube = cubes.At(index);
        uint64_t conflicts = 0;
        uint64_t outside = 0;
        for (size_t word = 0; word < space.NumInputWords(); ++word) {
            conflicts |= InputConflicts(space, cube, prime, word);
            outside |= cube[word] & ~prime[word] & space.Inputs(word);
        }
        uint64_t outputsOutside = 0;
        for (size_t word = space.FirstOutputWord(); word < space.NumWords(); ++word)
            outputsOutside |= cube[word] & ~prime[word] & space.Outputs(word);
        const bool isForAll = conflicts == 0 && outputsOutside != 0;
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
    CubeIndex cubeIndex(space, cubes);
    CubeIndex freeIndex(space, free);
    std::vector<uint32_t> found;
    for (size_t index = 0; index < cubes.Size(); ++index) {
        const uint64_t* prime = cubes.At(index);
        CubeList consensus(space.NumWords());
        freeIndex.Find(prime, 0, work, found);
        for (const uint32_t place : found)
            AppendCofactor(space, free.At(place), prime, consensus);
        cubeIndex.Find(prime, 1, work, found);
        AppendConsensus(space, cubes, found, index, prime, consensus);
        freeIndex.Find(prime, 1, work, found);
        AppendConsensus(space, free, found, SIZE_MAX, prime, consensus);
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
