// REDUCE, LAST GASP, and what removes literals from a finished cover.
#include "reduce.h"

#include <algorithm>
#include <numeric>

#include "cofactors.h"
#include "unate.h"

namespace booleq {

namespace {

// The smallest cube that contains the rows of cube 'index' that neither the other cubes nor the
// free ones cover. The two lists of 'cofactors' hold all of these. All words are 0 if no row is
// left.
void ReduceCube(const CubeSpace& space, const CubeList& cubes, size_t index, Cofactors& cofactors,
                Work& work, uint64_t* reduced)
{
    const uint64_t* cube = cubes.At(index);
    const size_t numInputWords = space.NumInputWords();
    // Inputs that the cube fixes stay as they are, so they count as found.
    std::vector<uint64_t> found(numInputWords);
    for (size_t word = 0; word < numInputWords; ++word) {
        const uint64_t both = cube[word] & cube[word] >> 1 & space.InputLow(word);
        found[word] = ~(both * 3);
    }
    std::fill(reduced, reduced + space.NumWords(), 0);
    bool isEmpty = true;
    cofactors.Take(cube, index);
    CubeList scratch(numInputWords);
    for (size_t output = 0; output < space.NumOutputs(); ++output) {
        if (!GetBit(cube, space.OutputBit(output)))
            continue;
        CubeList& cofactor = cofactors.OfOutput(output);
        scratch = cofactor;
        if (IsTautology(space, scratch, work))
            continue;
        isEmpty = false;
        SetBit(reduced, space.OutputBit(output));
        AddUncovered(space, cofactor, work, found.data());
    }
    if (isEmpty)
        return;
    for (size_t word = 0; word < numInputWords; ++word)
        reduced[word] |= cube[word] & found[word] & space.Inputs(word);
    assert(Contains(cube, reduced, space.NumWords()));
}

size_t SizeOf(const CubeSpace& space, const uint64_t* cube)
{
    size_t size = 0;
    for (size_t word = 0; word < space.NumWords(); ++word)
        size += CountBits(cube[word]);
    return size;
}

std::vector<uint32_t> OrderToReduce(const CubeSpace& space, const CubeList& cubes, bool isBySize)
{
    std::vector<uint32_t> order = OrderByWeight(space, cubes);
    std::reverse(order.begin(), order.end());
    if (isBySize || cubes.IsEmpty())
        return order;
    size_t largest = 0;
    std::vector<size_t> sizes(cubes.Size());
    for (size_t index = 0; index < cubes.Size(); ++index) {
        sizes[index] = SizeOf(space, cubes.At(index));
        if (sizes[index] > sizes[largest])
            largest = index;
    }
    std::vector<uint64_t> keys(cubes.Size());
    for (size_t index = 0; index < cubes.Size(); ++index)
        keys[index] = (uint64_t(Distance(space, cubes.At(largest), cubes.At(index)) + 1) << 32) -
                      sizes[index];
    std::iota(order.begin(), order.end(), 0u);
    std::stable_sort(order.begin(), order.end(),
                     [&](uint32_t left, uint32_t right) { return keys[left] < keys[right]; });
    return order;
}

} // namespace

void ReduceCover(const CubeSpace& space, Cover& cover, const CubeList& free, bool isBySize,
                 Work& work)
{
    CubeList& cubes = cover.cubes;
    std::vector<uint64_t> reduced(space.NumWords());
    std::vector<uint8_t> isKept(cubes.Size(), 1);
    CubeIndex cubeIndex(space, cubes);
    CubeIndex freeIndex(space, free);
    Cofactors cofactors(space, cubeIndex, freeIndex, work);
    for (const uint32_t index : OrderToReduce(space, cubes, isBySize)) {
        ReduceCube(space, cubes, index, cofactors, work, reduced.data());
        if (IsSameCube(reduced.data(), cubes.At(index), space.NumWords()))
            continue;
        assert(Contains(cubes.At(index), reduced.data(), space.NumWords()));
        CopyCube(cubes.At(index), reduced.data(), space.NumWords());
        cubeIndex.Update(index);
        cover.isPrime[index] = 0;
        if (!HasCommonOutput(space, reduced.data(), reduced.data()))
            isKept[index] = 0;
    }
    KeepInCover(cover, isKept);
}

size_t AddLastGasp(const CubeSpace& space, Expander& expander, Cover& cover, const CubeList& free,
                   Work& work)
{
    const size_t numWords = space.NumWords();
    CubeList reduced(numWords);
    CubeIndex cubeIndex(space, cover.cubes);
    CubeIndex freeIndex(space, free);
    Cofactors cofactors(space, cubeIndex, freeIndex, work);
    for (size_t index = 0; index < cover.cubes.Size(); ++index) {
        reduced.Resize(reduced.Size() + 1);
        ReduceCube(space, cover.cubes, index, cofactors, work, reduced.At(reduced.Size() - 1));
        if (IsSameCube(reduced.At(reduced.Size() - 1), cover.cubes.At(index), numWords))
            reduced.Resize(reduced.Size() - 1); // a prime that does not shrink takes in no other
    }
    const OpenCubes others(space, reduced, true);
    std::vector<uint64_t> cube(numWords);
    CubeList added(numWords);
    for (size_t left = 0; left < reduced.Size(); ++left) {
        for (size_t right = left + 1; right < reduced.Size(); ++right) {
            for (size_t word = 0; word < numWords; ++word)
                cube[word] = reduced.At(left)[word] | reduced.At(right)[word];
            if (!expander.IsImplicant(cube.data()))
                continue;
            expander.Expand(cube.data(), nullptr, others);
            added.Append(cube.data());
        }
    }
    added.SortAndUnite();
    cover.cubes.Append(added);
    cover.isPrime.resize(cover.cubes.Size(), 1);
    return added.Size();
}

void MakeSparse(const CubeSpace& space, Expander& expander, Cover& cover, const CubeList& free,
                Work& work)
{
    CubeList& cubes = cover.cubes;
    // Cubes with many literals lose outputs first: they cost the most to keep.
    std::vector<uint32_t> order(cubes.Size());
    std::iota(order.begin(), order.end(), 0u);
    std::stable_sort(order.begin(), order.end(), [&](uint32_t left, uint32_t right) {
        return CountCubeLiterals(space, cubes.At(left)) > CountCubeLiterals(space, cubes.At(right));
    });
    CubeIndex cubeIndex(space, cubes);
    CubeIndex freeIndex(space, free);
    Cofactors cofactors(space, cubeIndex, freeIndex, work);
    for (const uint32_t index : order) {
        cofactors.Take(cubes.At(index), index);
        for (size_t output = 0; output < space.NumOutputs(); ++output) {
            const size_t bit = space.OutputBit(output);
            if (!GetBit(cubes.At(index), bit) || CountOutputs(space, cubes.At(index)) == 1)
                continue;
            if (IsTautology(space, cofactors.OfOutput(output), work))
                ClearBit(cubes.At(index), bit);
        }
        assert(CountOutputs(space, cubes.At(index)) >= 1);
        cubeIndex.Update(index);
    }
    const CubeList noCubes(space.NumWords());
    const OpenCubes none(space, noCubes, false);
    std::vector<uint64_t> allowed(space.NumWords());
    for (size_t index = 0; index < cubes.Size(); ++index) {
        for (size_t word = 0; word < space.NumWords(); ++word)
            allowed[word] = space.Inputs(word);
        expander.Expand(cubes.At(index), allowed.data(), none);
        cover.isPrime[index] = 0;
    }
}

} // namespace booleq
