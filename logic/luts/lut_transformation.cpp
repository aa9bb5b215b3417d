// Inputs are exchanged by the delta swap of H. S. Warren, Hacker's Delight, 2nd edition, section
// 7-1.
#include "lut_transformation.h"

#include <algorithm>
#include <cassert>
#include <utility>

#include "lut_word.h"
#include "rows.h"

namespace booleq {

namespace {

uint64_t InvertInputs(uint64_t table, unsigned int inputs, unsigned int numInputs)
{
    for (unsigned int place = 0; place < numInputs; ++place)
        if ((inputs >> place & 1u) != 0)
            table = InvertLutBit(table, numInputs - 1 - place);
    return table;
}

// Input k of the result is input order[k] of the table.
uint64_t Reorder(uint64_t table, const uint8_t* order, unsigned int numInputs)
{
    uint8_t at[kMaxTransformedInputs] = {0, 1, 2, 3, 4, 5}; // the input that is now at a place
    for (unsigned int place = 0; place < numInputs; ++place) {
        unsigned int from = place;
        while (at[from] != order[place])
            ++from;
        assert(from < numInputs);
        if (from == place)
            continue;
        std::swap(at[from], at[place]);
        table = SwapLutBits(table, numInputs - 1 - from, numInputs - 1 - place);
    }
    return table;
}

} // namespace

uint64_t Transform(const LutTransformation& transformation, uint64_t table, unsigned int numInputs)
{
    assert(numInputs <= kMaxTransformedInputs);
    assert((table & ~RowMask(numInputs)) == 0);
    const uint64_t result = InvertInputs(Reorder(table, transformation.order, numInputs),
                                         transformation.invertedInputs, numInputs);
    return transformation.invertsOutput != 0 ? ~result & RowMask(numInputs) : result;
}

uint64_t TransformBack(const LutTransformation& transformation, uint64_t result,
                       unsigned int numInputs)
{
    assert(numInputs <= kMaxTransformedInputs);
    assert((result & ~RowMask(numInputs)) == 0);
    uint8_t inverse[kMaxTransformedInputs] = {0, 1, 2, 3, 4, 5};
    for (unsigned int place = 0; place < numInputs; ++place)
        inverse[transformation.order[place]] = static_cast<uint8_t>(place);
    const uint64_t table =
        Reorder(InvertInputs(result, transformation.invertedInputs, numInputs), inverse, numInputs);
    return transformation.invertsOutput != 0 ? ~table & RowMask(numInputs) : table;
}

LutTransformation Compose(const LutTransformation& first, const LutTransformation& second)
{
    LutTransformation both;
    unsigned int inverted = second.invertedInputs;
    for (unsigned int place = 0; place < kMaxTransformedInputs; ++place) {
        const unsigned int middle = second.order[place];
        both.order[place] = first.order[middle];
        inverted ^= (first.invertedInputs >> middle & 1u) << place;
    }
    both.invertedInputs = static_cast<uint8_t>(inverted);
    both.invertsOutput = static_cast<uint8_t>(first.invertsOutput ^ second.invertsOutput);
    return both;
}

} // namespace booleq
