// Proof by rows if they can be listed, otherwise by tautologies.
#include "proof.h"

#include "cofactors.h"
#include "row_table.h"
#include "unate.h"

namespace booleq {

namespace {

constexpr size_t kManyCubes = 1000; // with more, checking rows is faster

// Cubes that can be looked up by their inputs: whether one cube of a list contains a given one.
class LookUp {
  public:
    LookUp(const CubeSpace& space, const CubeList& cubes) : m_space(space), m_cubes(cubes)
    {
        UniteOutputs(space, m_cubes); // this also sorts them
    }

    bool Holds(const uint64_t* cube) const
    {
        size_t first = 0;
        size_t count = m_cubes.Size();
        while (count > 0) { // finds the first that is not less
            const size_t half = count / 2;
            if (CompareInputs(m_space, m_cubes.At(first + half), cube) < 0) {
                first += half + 1;
                count -= half + 1;
            } else {
                count = half;
            }
        }
        return first < m_cubes.Size() && Contains(m_cubes.At(first), cube, m_space.NumWords()) &&
               CompareInputs(m_space, m_cubes.At(first), cube) == 0;
    }

  private:
    const CubeSpace& m_space;
    CubeList m_cubes;
};

bool DoCoverAll(const CubeSpace& space, const CubeList& cubes, CubeIndex& first, CubeIndex& second,
                Work& work)
{
    const LookUp given(space, first.Cubes());
    Cofactors cofactors(space, first, second, work);
    for (size_t index = 0; index < cubes.Size(); ++index)
        if (!given.Holds(cubes.At(index)) && !cofactors.Cover(cubes.At(index), SIZE_MAX))
            return false;
    return true;
}

// Whether what is on lies in the sum; the free cubes, which may be many, are used only if it does
// not.
bool IsOnCovered(const Pla& table, CubeIndex& sum, CubeIndex& free, Work& work)
{
    const CubeList none(table.space.NumWords());
    CubeIndex noIndex(table.space, none);
    Cofactors ofSum(table.space, sum, noIndex, work);
    Cofactors ofBoth(table.space, sum, free, work);
    const LookUp inSum(table.space, sum.Cubes());
    for (size_t index = 0; index < table.on.Size(); ++index)
        if (!inSum.Holds(table.on.At(index)) && !ofSum.Cover(table.on.At(index), SIZE_MAX) &&
            !ofBoth.Cover(table.on.At(index), SIZE_MAX))
            return false;
    return true;
}

bool IsSumRight(const Pla& table, const CubeList& sum, Work& work)
{
    const CubeSpace& space = table.space;
    CubeIndex sumIndex(space, sum);
    CubeIndex onIndex(space, table.on);
    CubeIndex freeIndex(space, table.free);
    if (!IsOnCovered(table, sumIndex, freeIndex, work))
        return false;
    if (table.type == PlaType::Fr || table.type == PlaType::Fdr) {
        size_t left = 0;
        size_t right = 0;
        return !FindMeeting(space, sum, table.off, work, left, right);
    }
    return DoCoverAll(space, sum, onIndex, freeIndex, work); // everything else is off
}

// The inverted sum must be 1 on every row that is off or not mentioned, and 0 if on and not free.
bool IsInversionRight(const Pla& table, const CubeList& sum, Work& work)
{
    const CubeSpace& space = table.space;
    const bool areZerosGiven = table.type == PlaType::Fr || table.type == PlaType::Fdr;
    const CubeList none(space.NumWords());
    CubeIndex sumIndex(space, sum);
    CubeIndex freeIndex(space, table.free);
    CubeIndex noIndex(space, none);
    if (areZerosGiven) {
        if (!DoCoverAll(space, table.off, sumIndex, noIndex, work))
            return false;
    } else {
        CubeList known = table.on;
        known.Append(table.free);
        std::vector<uint64_t> all(space.NumWords());
        for (size_t word = 0; word < all.size(); ++word)
            all[word] = space.All(word);
        if (!IsCovered(space, all.data(), sum, known, work))
            return false;
    }
    Cofactors ofFree(space, freeIndex, noIndex, work);
    std::vector<uint64_t> common(space.NumWords());
    std::vector<uint32_t> found;
    for (size_t index = 0; index < table.on.Size(); ++index) {
        sumIndex.Find(table.on.At(index), 0, work, found);
        for (const uint32_t term : found) {
            for (size_t word = 0; word < common.size(); ++word)
                common[word] = table.on.At(index)[word] & sum.At(term)[word];
            if (!ofFree.Cover(common.data(), SIZE_MAX))
                return false;
        }
    }
    return true;
}

} // namespace

bool IsSumOf(const Pla& table, const CubeList& sum, bool isInverted, Work& work)
{
    if (CanListRows(table) && table.on.Size() > kManyCubes)
        return IsSumOfRows(table.space, ListRows(table, isInverted, work), sum, work);
    return isInverted ? IsInversionRight(table, sum, work) : IsSumRight(table, sum, work);
}

} // namespace booleq
