// Choice of the input to split by, and cofactors on the stack.
#include "unate_walk.h"

#include <algorithm>

namespace booleq {

size_t ChooseInput(const CubeSpace& space, const CubeList& stack, StackPart part,
                   const uint64_t* candidates, std::vector<uint32_t>& counts)
{
    const size_t numWords = space.NumInputWords();
    counts.assign(64 * numWords, 0);
    for (size_t index = part.first; index < part.first + part.count; ++index) {
        const uint64_t* cube = stack.At(index);
        for (size_t word = 0; word < numWords; ++word) {
            uint64_t absent = ~cube[word] & candidates[word] * 3;
            for (; absent != 0; absent &= absent - 1)
                ++counts[64 * word + LowestBit(absent)];
        }
    }
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
