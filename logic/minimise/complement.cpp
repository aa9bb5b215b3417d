// Complement by unate recursion. Cubes that both halves of a split have are merged again; parts of
// up to six inputs are covered as a word of rows.
#include <algorithm>

#include "cofactors.h"
#include "small_cover.h"
#include "unate.h"
#include "unate_walk.h"

namespace booleq {

namespace {

constexpr uint64_t kMaxPairsToLift = 1u << 16; // beyond that only equal cubes are merged
// A complement that takes more work than this for each cube that it may have counts as too large.
constexpr uint64_t kMaxUnitsForCube = 1u << 9;

class ComplementSearch {
  public:
    ComplementSearch(const CubeSpace& space, CubeList& stack, size_t maxCubes, Work& work)
        : m_space(space), m_stack(stack), m_max_cubes(maxCubes), m_work(work),
          m_max_spent(maxCubes > SIZE_MAX / kMaxUnitsForCube
                          ? UINT64_MAX
                          : work.Spent() + maxCubes * kMaxUnitsForCube),
          m_num_words(space.NumInputWords()), m_zeros(m_num_words), m_ones(m_num_words),
          m_candidates(m_num_words), m_full(m_num_words, ~uint64_t(0))
    {
    }

    // After IsTooLarge() the result is meaningless.  Depth: one level for each input.
    CubeList Find(StackPart part)
    {
        CubeList result(m_num_words);
        m_work.Spend(2 * part.count * m_num_words + 1);
        if (part.count == 0)
            result.Append(m_full.data());
        if (part.count == 0 || HasUniversal(m_stack, part))
            return result;
        const std::vector<uint64_t> common = TakeOutCommon(part, result);
        if (!HasUniversal(m_stack, part))
            AppendRest(part, common, result);
        m_is_too_large =
            m_is_too_large || result.Size() > m_max_cubes || m_work.Spent() > m_max_spent;
        return result;
    }

    bool IsTooLarge() const { return m_is_too_large; }

  private:
    // Handles literals that all cubes have: the opposite of each is a cube of the complement, and
    // the cubes lose them. Returns the cube of these literals.
    std::vector<uint64_t> TakeOutCommon(StackPart part, CubeList& result)
    {
        std::vector<uint64_t> common(m_num_words);
        for (size_t index = part.first; index < part.first + part.count; ++index)
            for (size_t word = 0; word < m_num_words; ++word)
                common[word] |= m_stack.At(index)[word];
        for (size_t word = 0; word < m_num_words; ++word) {
            const uint64_t absent = ~common[word];
            for (uint64_t rest = absent; rest != 0; rest &= rest - 1) {
                const size_t bit = LowestBit(rest);
                result.Append(m_full.data());
                ClearBit(result.At(result.Size() - 1), 64 * word + (bit ^ 1));
            }
            for (size_t index = part.first; index < part.first + part.count; ++index)
                m_stack.At(index)[word] |= absent;
        }
        return common;
    }

    void AppendRest(StackPart part, const std::vector<uint64_t>& common, CubeList& result)
    {
        size_t numActive = 0;
        uint64_t anyBinate = 0;
        for (size_t word = 0; word < m_num_words; ++word) {
            const Occurrence occurrence = FindOccurrence(m_space, m_stack, part, word);
            m_zeros[word] = occurrence.zeros;
            m_ones[word] = occurrence.ones;
            numActive += CountBits(occurrence.zeros | occurrence.ones);
            anyBinate |= occurrence.zeros & occurrence.ones;
        }
        assert(numActive > 0);
        CubeList rest(m_num_words);
        if (numActive <= kWordInputs)
            CoverRows(part, rest);
        else
            Split(part, anyBinate != 0, rest);
        for (size_t index = 0; index < rest.Size(); ++index)
            for (size_t word = 0; word < m_num_words; ++word)
                rest.At(index)[word] &= common[word];
        result.Append(rest);
    }

    void CoverRows(StackPart part, CubeList& result)
    {
        std::vector<uint64_t>& inputs = m_candidates; // no split follows
        for (size_t word = 0; word < m_num_words; ++word)
            inputs[word] = m_zeros[word] | m_ones[word];
        WordRows rows;
        rows.SetInputs(inputs);
        m_small.clear();
        FindSmallCover(~rows.Covered(m_stack, part), rows.NumInputs(), m_small);
        for (const SmallCube& cube : m_small) {
            result.Append(m_full.data());
            for (size_t place = 0; place < rows.NumInputs(); ++place) {
                if ((cube.zeros >> place & 1) != 0)
                    ClearBit(result.At(result.Size() - 1), rows.LowBit(place) + 1);
                if ((cube.ones >> place & 1) != 0)
                    ClearBit(result.At(result.Size() - 1), rows.LowBit(place));
            }
        }
    }

    void Split(StackPart part, bool hasBinate, CubeList& result)
    {
        for (size_t word = 0; word < m_num_words; ++word)
            m_candidates[word] =
                hasBinate ? m_zeros[word] & m_ones[word] : m_zeros[word] | m_ones[word];
        const size_t bit = ChooseInput(m_space, m_stack, part, m_candidates.data(), m_counts);
        const bool hasZeros = GetBit(m_zeros.data(), bit);
        const bool hasOnes = GetBit(m_ones.data(), bit);
        CubeList halves[2] = {CubeList(m_num_words), CubeList(m_num_words)};
        for (const size_t value : {0u, 1u}) {
            const StackPart half = PushCofactor(m_stack, part, bit, value == 1);
            halves[value] = Find(half);
            m_stack.Resize(half.first);
            if (m_is_too_large)
                return;
        }
        // A row that is left out for the value where more is covered is left out for both values.
        if (!hasZeros)
            Unite(halves[1], halves[0], bit + 1, result);
        else if (!hasOnes)
            Unite(halves[0], halves[1], bit, result);
        else
            Merge(halves[0], halves[1], bit, result);
    }

    // Appends 'both' for either value, and the cubes of 'one' that lie in none of these for one
    // value.
    void Unite(const CubeList& both, const CubeList& one, size_t bitToClear, CubeList& result)
    {
        const std::vector<uint8_t> isIn = FindContained(one, both);
        result.Append(both);
        for (size_t index = 0; index < one.Size(); ++index)
            if (isIn[index] == 0)
                AppendWithout(one.At(index), bitToClear, result);
    }

    // Which of 'cubes' lie in a cube of 'holders'; with many pairs, only which are equal to one.
    std::vector<uint8_t> FindContained(const CubeList& cubes, const CubeList& holders)
    {
        std::vector<uint8_t> isIn(cubes.Size(), 0);
        const uint64_t numPairs = uint64_t(cubes.Size()) * holders.Size();
        if (numPairs > kMaxPairsToLift) {
            FindEqual(cubes, holders, isIn);
            return isIn;
        }
        m_work.Spend(numPairs);
        for (size_t index = 0; index < cubes.Size(); ++index)
            isIn[index] = IsInOne(holders, cubes.At(index)) ? 1 : 0;
        return isIn;
    }

    bool IsInOne(const CubeList& holders, const uint64_t* cube) const
    {
        const uint64_t first = cube[0]; // tells most of them apart
        for (size_t index = 0; index < holders.Size(); ++index)
            if ((first & ~holders.At(index)[0]) == 0 &&
                Contains(holders.At(index), cube, m_num_words))
                return true;
        return false;
    }

    void FindEqual(const CubeList& cubes, const CubeList& holders, std::vector<uint8_t>& isIn)
    {
        size_t numSlots = 2;
        while (numSlots < 2 * holders.Size())
            numSlots *= 2;
        std::vector<uint32_t> slots(numSlots, UINT32_MAX); // a holder or none; half are free
        const auto slotOf = [&](const uint64_t* cube) {
            uint64_t hash = 0;
            for (size_t word = 0; word < m_num_words; ++word)
                hash = ((hash ^ cube[word]) + 0x9e3779b97f4a7c15u) * 0xbf58476d1ce4e5b9u;
            size_t slot = static_cast<size_t>(hash >> 32) & (numSlots - 1);
            while (slots[slot] != UINT32_MAX &&
                   !IsSameCube(holders.At(slots[slot]), cube, m_num_words))
                slot = (slot + 1) & (numSlots - 1);
            return slot;
        };
        m_work.Spend(8 * (cubes.Size() + holders.Size()));
        for (size_t index = 0; index < holders.Size(); ++index)
            slots[slotOf(holders.At(index))] = static_cast<uint32_t>(index);
        for (size_t index = 0; index < cubes.Size(); ++index)
            isIn[index] = slots[slotOf(cubes.At(index))] != UINT32_MAX ? 1 : 0;
    }

    void Merge(const CubeList& zero, const CubeList& one, size_t bit, CubeList& result)
    {
        const std::vector<uint8_t> isLiftedZero = FindContained(zero, one);
        const std::vector<uint8_t> isLiftedOne = FindContained(one, zero);
        CubeList lifted(m_num_words);
        for (size_t index = 0; index < zero.Size(); ++index)
            if (isLiftedZero[index] != 0)
                lifted.Append(zero.At(index));
            else
                AppendWithout(zero.At(index), bit + 1, result);
        for (size_t index = 0; index < one.Size(); ++index)
            if (isLiftedOne[index] != 0)
                lifted.Append(one.At(index));
            else
                AppendWithout(one.At(index), bit, result);
        assert(lifted.Size() <= zero.Size() + one.Size());
        lifted.SortAndUnite(); // equal cubes of both halves are one
        result.Append(lifted);
    }

    static void AppendWithout(const uint64_t* cube, size_t bit, CubeList& result)
    {
        result.Append(cube);
        ClearBit(result.At(result.Size() - 1), bit);
    }

    const CubeSpace& m_space;
    CubeList& m_stack;
    size_t m_max_cubes;
    bool m_is_too_large = false;
    Work& m_work;
    uint64_t m_max_spent;
    size_t m_num_words;
    std::vector<uint64_t> m_zeros;
    std::vector<uint64_t> m_ones;
    std::vector<uint64_t> m_candidates;
    std::vector<uint64_t> m_full;
    std::vector<uint32_t> m_counts;
    std::vector<SmallCube> m_small;
};

} // namespace

bool ComplementInputs(const CubeSpace& space, CubeList& cubes, size_t maxCubes, Work& work,
                      CubeList& result)
{
    assert(cubes.NumWords() == space.NumInputWords());
    ComplementSearch search(space, cubes, maxCubes, work);
    result = search.Find({0, cubes.Size()});
    return !search.IsTooLarge();
}

void UniteOutputs(const CubeSpace& space, CubeList& cubes)
{
    const size_t numWords = space.NumWords();
    std::vector<uint32_t> order(cubes.Size());
    for (size_t index = 0; index < order.size(); ++index)
        order[index] = static_cast<uint32_t>(index);
    const auto compare = [&](uint32_t left, uint32_t right) {
        return CompareInputs(space, cubes.At(left), cubes.At(right));
    };
    std::stable_sort(order.begin(), order.end(),
                     [&](uint32_t left, uint32_t right) { return compare(left, right) < 0; });
    CubeList united(numWords);
    for (size_t place = 0; place < order.size(); ++place) {
        if (place == 0 || compare(order[place - 1], order[place]) != 0)
            united.Append(cubes.At(order[place]));
        for (size_t word = 0; word < numWords; ++word)
            united.At(united.Size() - 1)[word] |= cubes.At(order[place])[word];
    }
    assert(united.Size() <= cubes.Size());
    cubes = united;
}

CubeList Complement(const CubeSpace& space, const CubeList& first, const CubeList& second,
                    Work& work)
{
    CubeList result(space.NumWords());
    const bool isWhole = FindComplement(space, first, second, SIZE_MAX, work, result);
    assert(isWhole);
    static_cast<void>(isWhole);
    return result;
}

bool FindComplement(const CubeSpace& space, const CubeList& first, const CubeList& second,
                    size_t maxCubes, Work& work, CubeList& result)
{
    assert(&result != &first);
    assert(&result != &second);
    result.Resize(0);
    for (size_t output = 0; output < space.NumOutputs(); ++output) {
        CubeList cubes(space.NumInputWords());
        AppendOfOutput(space, first, output, cubes);
        AppendOfOutput(space, second, output, cubes);
        CubeList rows(space.NumInputWords());
        if (!ComplementInputs(space, cubes, maxCubes, work, rows)) {
            result.Resize(0);
            return false;
        }
        for (size_t index = 0; index < rows.Size(); ++index) {
            result.Resize(result.Size() + 1);
            uint64_t* cube = result.At(result.Size() - 1);
            for (size_t word = 0; word < space.NumInputWords(); ++word)
                cube[word] = rows.At(index)[word] & space.Inputs(word);
            SetBit(cube, space.OutputBit(output));
        }
    }
    UniteOutputs(space, result);
    return true;
}

} // namespace booleq
