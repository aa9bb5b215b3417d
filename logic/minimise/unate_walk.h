// What recursions over the inputs of a cover share: a stack of cubes, and what a step has to know
// of the cubes on top of it. Of use to the functions of unate.h and to the search for a minimal
// part of a cover.
#ifndef BOOLEQ_MINIMISE_UNATE_WALK_H
#define BOOLEQ_MINIMISE_UNATE_WALK_H

#include "cube.h"

namespace booleq {

// A list of cubes that are all on one stack, by their place there.
struct StackPart {
    size_t first;
    size_t count;
};

// How the inputs of a word occur in a part: low bits of the inputs that some cube fixes to 0, to 1.
struct Occurrence {
    uint64_t zeros;
    uint64_t ones;
};

// The occurrence of the inputs of word 'word'.
inline Occurrence FindOccurrence(const CubeSpace& space, const CubeList& stack, StackPart part,
                                 size_t word)
{
    uint64_t all = ~uint64_t(0);
    for (size_t index = part.first; index < part.first + part.count; ++index)
        all &= stack.At(index)[word];
    return {~all >> 1 & space.InputLow(word), ~all & space.InputLow(word)};
}

inline bool IsUniversal(const uint64_t* inputs, size_t numWords)
{
    uint64_t all = ~uint64_t(0);
    for (size_t word = 0; word < numWords; ++word)
        all &= inputs[word];
    return all == ~uint64_t(0);
}

// The input, as the number of its pair's low bit, that most cubes fix, and among those that the
// most evenly; only inputs of 'candidates' (low bits, one word each) count.
// Requires: a candidate. 'zeros' and 'ones' are scratch space of 64 * NumInputWords() counts.
size_t ChooseInput(const CubeSpace& space, const CubeList& stack, StackPart part,
                   const uint64_t* candidates, std::vector<uint32_t>& counts);

// Pushes the cofactor of the part with respect to one value of the input whose low bit is given;
// returns where it lies.
StackPart PushCofactor(CubeList& stack, StackPart part, size_t lowBit, bool value);

} // namespace booleq

#endif
