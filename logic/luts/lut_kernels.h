// What is asked of, and done to, all tables of an array. In: tables, and one argument for all or
// one each; out: arrays that the caller has, one element for each table. 'results' has tables of
// the shape of the input and may be the same memory, but not overlap it otherwise. Fails:
// std::bad_alloc, and what Watch() throws.  Cost: in step with the tables; some nanoseconds each.
#ifndef BOOLEQ_LUTS_LUT_KERNELS_H
#define BOOLEQ_LUTS_LUT_KERNELS_H

#include "lut_array.h"

namespace booleq {

// Sets of inputs: bit k is input k.
constexpr uint8_t AllLutInputs(unsigned int numInputs)
{
    return static_cast<uint8_t>((1u << numInputs) - 1);
}

// The value, 0 or 1, of every table in one row; the row's number has input 0 as its most
// significant bit.  Requires: row < 2^numInputs.
void EvaluateLuts(const LutArray& luts, uint8_t row, uint8_t* values,
                  const LutWork& work = LutWork());
// The same in a row each.  Requires: every row < 2^numInputs.
void EvaluateLutsEach(const LutArray& luts, const uint8_t* rows, uint8_t* values,
                      const LutWork& work = LutWork());

// Input k of the result is input order[k] of the table, as PermuteInputs of rows.h has it.
// Requires: order is a permutation of the numInputs inputs.
void PermuteLuts(const LutArray& luts, const uint8_t* order, void* results,
                 const LutWork& work = LutWork());
// The same with an order each: those of a table are numInputs elements in a row.
// Requires: FirstBadOrder finds none.
void PermuteLutsEach(const LutArray& luts, const uint8_t* orders, void* results,
                     const LutWork& work = LutWork());
// The place of the first of 'count' orders that is not a permutation of the inputs; kNoLut: none.
size_t FirstBadOrder(const uint8_t* orders, size_t count, unsigned int numInputs,
                     const LutWork& work = LutWork());

// Every row's value is inverted.
void InvertLuts(const LutArray& luts, void* results, const LutWork& work = LutWork());
// The function with an input fixed, over the other inputs: 'results' has tables of one input less,
// which take resultBytes each.  Requires: input < numInputs; HasLutShape(numInputs - 1,
// resultBytes); other memory than the tables.
void FixLutInput(const LutArray& luts, unsigned int input, bool value, void* results,
                 unsigned int resultBytes, const LutWork& work = LutWork());

// The inputs that matter, as a set; the idle ones are the others.
void FindLutSupports(const LutArray& luts, uint8_t* inputs, const LutWork& work = LutWork());
// In how many rows a table is 1, at most 128.
void CountLutOnes(const LutArray& luts, uint8_t* counts, const LutWork& work = LutWork());

} // namespace booleq

#endif
