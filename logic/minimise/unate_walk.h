// What recursions over the inputs of a cover share: a stack of cubes, what a step has to know about
// the cubes on top of it, and the rows of the last few inputs as a word. Used by the functions of
// unate.h and by the search for a minimal part of a cover.
#ifndef BOOLEQ_MINIMISE_UNATE_WALK_H
#define BOOLEQ_MINIMISE_UNATE_WALK_H

#include "cube.h"
#include "small_cover.h"

namespace booleq {

// A list of cubes on one stack that holds all lists, by its place there.
struct StackPart {
    size_t first;
    size_t count;
};

// How the inputs of a word occur in a part: the low bits of the inputs that some cube fixes to 0,
// to 1.
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

// How many inputs of a part occur in both ways, and whether others occur in only one.
struct UnateCount {
    size_t numBinate = 0;
    bool hasUnate = false;
};

// Counts them; 'binate' gets the low bits of the inputs that occur in both ways.
// Requires: 'binate' has a word for each input word of the space.
UnateCount FindBinate(const CubeSpace& space, const CubeList& stack, StackPart part,
                      std::vector<uint64_t>& binate);

inline bool IsUniversal(const uint64_t* inputs, size_t numWords)
{
    uint64_t all = ~uint64_t(0);
    for (size_t word = 0; word < numWords; ++word)
        all &= inputs[word];
    return all == ~uint64_t(0);
}

// The input, as the number of its pair's low bit, that the most cubes fix; among equal ones the one
// fixed most evenly. Only inputs of 'candidates' (low bits, one word each) count.
// Requires: a candidate. 'counts' is scratch space.
size_t ChooseInput(const CubeSpace& space, const CubeList& stack, StackPart part,
                   const uint64_t* candidates, std::vector<uint32_t>& counts);

// Whether a cube of the part covers all rows.
bool HasUniversal(const CubeList& stack, StackPart part);

// Moves the cubes that fix only inputs of 'binate' (low bits) to the front of the part, and leaves
// the others out. 'labels', null or one for each cube of the stack, move with them.
void DropUnate(CubeList& stack, StackPart& part, const std::vector<uint64_t>& binate,
               std::vector<uint32_t>* labels);

// Up to kWordInputs inputs, and the rows over them as bits of a word: input 'place' of the list
// has the value 1 in the rows of BitPattern(place).
class WordRows {
  public:
    // Requires: the words have at most kWordInputs low bits.
    void SetInputs(const std::vector<uint64_t>& inputs);
    size_t NumInputs() const { return m_num_inputs; }
    // The low bit of the pair of input 'place'.
    size_t LowBit(size_t place) const { return m_low_bits[place]; }
    // The rows that the cubes of the part cover.
    // Requires: the cubes fix no other inputs.
    uint64_t Covered(const CubeList& stack, StackPart part) const;

  private:
    size_t m_low_bits[kWordInputs] = {};
    size_t m_num_inputs = 0;
};

// Pushes the cofactor of the part with respect to a value of the input with the given low bit;
// returns its place.
StackPart PushCofactor(CubeList& stack, StackPart part, size_t lowBit, bool value);

} // namespace booleq

#endif
