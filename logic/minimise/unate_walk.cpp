// The choice of an input to split by, and cofactors on the stack.
#include "unate_walk.h"

#include <algorithm>

namespace booleq {

namespace {

// Adds two words to a plane of counts; returns the carry to the next plane.
inline uint64_t AddTwo(uint64_t& plane, uint64_t left, uint64_t right)
{
    const uint64_t different = plane ^ left;
    const uint64_t carry = (plane & left) | (different & right);
    plane = different ^ right;
    return carry;
}

// Counts how many cubes lack each bit of 'asked', four cubes at a time. The counts of a word grow
// side by side: bit k of planes[p] is bit p of the count for bit k.
void CountAbsent(const CubeList& stack, StackPart part, size_t word, uint64_t asked,
                 uint32_t* counts)
{
    assert(part.count <= UINT32_MAX);
    uint64_t planes[33] = {};
    const auto absent = [&](size_t place) {
        return place < part.count ? ~stack.At(part.first + place)[word] & asked : 0;
    };
    for (size_t place = 0; place < part.count; place += 4) {
        const uint64_t first = AddTwo(planes[0], absent(place), absent(place + 1));
        const uint64_t second = AddTwo(planes[0], absent(place + 2), absent(place + 3));
        uint64_t carry = AddTwo(planes[1], first, second);
        for (size_t plane = 2; carry != 0; ++plane) {
            const uint64_t both = planes[plane] & carry;
            planes[plane] ^= carry;
            carry = both;
        }
    }
    for (size_t plane = 0; plane < 32 && part.count >> plane != 0; ++plane)
        for (uint64_t rest = planes[plane]; rest != 0; rest &= rest - 1)
            counts[LowestBit(rest)] += uint32_t(1) << plane;
}

} // namespace

UnateCount FindBinate(const CubeSpace& space, const CubeList& stack, StackPart part,
                      std::vector<uint64_t>& binate)
{
    UnateCount count;
    uint64_t anyUnate = 0;
    for (size_t word = 0; word < binate.size(); ++word) {
        const Occurrence occurrence = FindOccurrence(space, stack, part, word);
        binate[word] = occurrence.zeros & occurrence.ones;
        count.numBinate += CountBits(binate[word]);
        anyUnate |= occurrence.zeros ^ occurrence.ones;
    }
    count.hasUnate = anyUnate != 0;
    return count;
}

size_t ChooseInput(const CubeSpace& space, const CubeList& stack, StackPart part,
                   const uint64_t* candidates, std::vector<uint32_t>& counts)
{
    const size_t numWords = space.NumInputWords();
    counts.assign(64 * numWords, 0);
    for (size_t word = 0; word < numWords; ++word)
        CountAbsent(stack, part, word, candidates[word] * 3, counts.data() + 64 * word);
    size_t best = SIZE_MAX;
    uint32_t bestSum = 0;
    uint32_t bestSmaller = 0;
    for (size_t word = 0; word < numWords; ++word) {
        for (uint64_t rest = candidates[word]; rest != 0; rest &= rest - 1) {
            const size_t bit = 64 * word + LowestBit(rest);
            const uint32_t sum = counts[bit] + counts[bit + 1];
            const uint32_t smaller = std::min(counts[bit], counts[bit + 1]);
            if (best == SIZE_MAX || sum > bestSum || (sum == bestSum && smaller > bestSmaller)) {
                best = bit;
                bestSum = sum;
                bestSmaller = smaller;
            }
        }
    }
    assert(best != SIZE_MAX);
    return best;
}

bool HasUniversal(const CubeList& stack, StackPart part)
{
    for (size_t index = part.first; index < part.first + part.count; ++index)
        if (IsUniversal(stack.At(index), stack.NumWords()))
            return true;
    return false;
}

void DropUnate(CubeList& stack, StackPart& part, const std::vector<uint64_t>& binate,
               std::vector<uint32_t>* labels)
{
    assert(!labels || labels->size() == stack.Size());
    const size_t numWords = stack.NumWords();
    size_t count = 0;
    for (size_t index = part.first; index < part.first + part.count; ++index) {
        const uint64_t* cube = stack.At(index);
        uint64_t fixed = 0;
        for (size_t word = 0; word < numWords; ++word)
            fixed |= ~cube[word] & ~(binate[word] * 3);
        if (fixed != 0)
            continue;
        if (labels)
            (*labels)[part.first + count] = (*labels)[index];
        CopyCube(stack.At(part.first + count++), cube, numWords);
    }
    assert(count < part.count); // some cube fixes an input that is not binate
    part.count = count;
}

void WordRows::SetInputs(const std::vector<uint64_t>& inputs)
{
    m_num_inputs = 0;
    for (size_t word = 0; word < inputs.size(); ++word) {
        for (uint64_t rest = inputs[word]; rest != 0; rest &= rest - 1) {
            assert(m_num_inputs < kWordInputs);
            m_low_bits[m_num_inputs++] = 64 * word + LowestBit(rest);
        }
    }
}

uint64_t WordRows::Covered(const CubeList& stack, StackPart part) const
{
    uint64_t covered = 0;
    for (size_t index = part.first; index < part.first + part.count; ++index) {
        const uint64_t* cube = stack.At(index);
        uint64_t rows = ~uint64_t(0);
        for (size_t place = 0; place < m_num_inputs; ++place) {
            const size_t bit = m_low_bits[place];
            const uint64_t pair = cube[bit / 64] >> (bit % 64) & 3;
            assert(pair != 0);
            if (pair != 3)
                rows &= pair == 2 ? BitPattern(place) : ~BitPattern(place);
        }
        covered |= rows;
    }
    return covered;
}

StackPart PushCofactor(CubeList& stack, StackPart part, size_t lowBit, bool value)
{
    const StackPart pushed = {stack.Size(), 0};
    const size_t numWords = stack.NumWords();
    size_t count = 0;
    stack.Resize(pushed.first + part.count);
    for (size_t index = part.first; index < part.first + part.count; ++index) {
        if (!GetBit(stack.At(index), value ? lowBit + 1 : lowBit))
            continue;
        uint64_t* target = stack.At(pushed.first + count++);
        CopyCube(target, stack.At(index), numWords);
        target[lowBit / 64] |= uint64_t(3) << (lowBit % 64);
    }
    stack.Resize(pushed.first + count);
    return {pushed.first, count};
}

} // namespace booleq
