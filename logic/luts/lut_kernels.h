// Questions about, and changes to, all tables of an array. In: tables, and one argument for all or
// one for each; out: the caller's arrays, one element for each table. 'results' has tables of the
// input's shape and may be the same memory, but may not overlap it otherwise.
// Fails: std::bad_alloc, and what Watch() throws.  Cost: some nanoseconds for each table.
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
// The same with a row for each table.  Requires: every row < 2^numInputs.
void EvaluateLutsEach(const LutArray& luts, const uint8_t* rows, uint8_t* values,
                      const LutWork& work = LutWork());

// Input k of the result is input order[k] of the table, as for PermuteInputs (rows.h).
// Requires: order is a permutation of the numInputs inputs.
void PermuteLuts(const LutArray& luts, const uint8_t* order, void* results,
                 const LutWork& work = LutWork());
// The same with an order for each table: numInputs consecutive elements of 'orders'.
// Requires: FirstBadOrder finds none.
void PermuteLutsEach(const LutArray& luts, const uint8_t* orders, void* results,
                     const LutWork& work = LutWork());
// The place of the first of 'count' orders that is not a permutation of the inputs; kNoLut: none.
size_t FirstBadOrder(const uint8_t* orders, size_t count, unsigned int numInputs,
                     const LutWork& work = LutWork());

// Every row's value is inverted.
void InvertLuts(const LutArray& luts, void* results, const LutWork& work = LutWork());
// The function of the other inputs when one input is fixed: 'results' has tables of one input less,
// resultBytes each.  Requires: input < numInputs; HasLutShape(numInputs - 1, resultBytes);
// 'results' is not the tables' memory.
void FixLutInput(const LutArray& luts, unsigned int input, bool value, void* results,
                 unsigned int resultBytes, const LutWork& work = LutWork());

// The inputs that matter, as a set; all others are idle.
void FindLutSupports(const LutArray& luts, uint8_t* inputs, const LutWork& work = LutWork());
// The number of rows in which a table is 1, at most 128.
void CountLutOnes(const LutArray& luts, uint8_t* counts, const LutWork& work = LutWork());

} // namespace booleq

#endif
