// Numbers of a function that no order of inputs and no inversion changes: its Walsh spectrum, up to
// signs, and the weights of its derivatives.
// In: a packed column. Out: one number for each set of inputs.
// Cost: n * 2^n additions, 3^n / 16 word operations; 16 inputs take some milliseconds.
#ifndef BOOLEQ_SEARCH_SPECTRUM_H
#define BOOLEQ_SEARCH_SPECTRUM_H

#include <cstdint>
#include <vector>

#include "rows.h"

namespace booleq {

constexpr unsigned int kMaxSpectrumInputs = 24; // sums stay within 32 bits

// Element s: the sum of (-1)^(f(x) + parity of x & s) over all rows x. It determines the function.
// Another order of the inputs permutes the bits of s; inversions change only signs.
// Requires: at most kMaxSpectrumInputs inputs.
std::vector<int32_t> WalshSpectrum(const Rows& rows);

// Element s: in how many rows the function differenced by each input of s is 1. Rows that differ
// only in inputs of s count once. 0 for the empty set, because an inversion of the output would
// change it. Inversions change none of the elements. Requires: as above.
std::vector<uint32_t> DerivativeWeights(const Rows& rows);

} // namespace booleq

#endif
