// An order of inputs with inversions, applied to tables of up to six inputs.
#ifndef BOOLEQ_LUTS_LUT_TRANSFORMATION_H
#define BOOLEQ_LUTS_LUT_TRANSFORMATION_H

#include <cstdint>

namespace booleq {

constexpr unsigned int kMaxTransformedInputs = 6;

// result(x) = table(y), inverted if invertsOutput, where y[order[k]] is x[k], inverted if bit k of
// invertedInputs is set: input k of the result is input order[k] of the table.
// Invariants: order is a permutation; places after the last input hold their own number and are not
// inverted.
struct LutTransformation {
    uint8_t order[kMaxTransformedInputs] = {0, 1, 2, 3, 4, 5};
    uint8_t invertedInputs = 0;
    uint8_t invertsOutput = 0; // 0 or 1
};
static_assert(sizeof(LutTransformation) == 8, "arrays of them are arrays of bytes elsewhere");

// What a transformation makes of a table.
// Requires, here and below: at most six inputs; no bit beyond the last row.
uint64_t Transform(const LutTransformation& transformation, uint64_t table, unsigned int numInputs);
// The table of which a transformation makes 'result'.
uint64_t TransformBack(const LutTransformation& transformation, uint64_t result,
                       unsigned int numInputs);
// One after the other: what 'second' makes of what 'first' makes.
LutTransformation Compose(const LutTransformation& first, const LutTransformation& second);

} // namespace booleq

#endif
