// What no order of inputs, and no inversion, changes of a function: its Walsh spectrum and the
// weights of its derivatives. In: a packed column; out: one number for each set of inputs. Cost: n
// * 2^n additions, 3^n / 16 word operations; 16 inputs take some milliseconds.
#ifndef BOOLEQ_SEARCH_SPECTRUM_H
#define BOOLEQ_SEARCH_SPECTRUM_H

#include <cstdint>
#include <vector>

#include "rows.h"

namespace booleq {

constexpr unsigned int kMaxSpectrumInputs = 24; // sums stay within 32 bits

// Element s: the sum of (-1)^(f(x) + parity of x & s) over all rows x. It determines the function.
// Other orders of the inputs permute the bits of s; inversions change signs only.
// Requires: at most kMaxSpectrumInputs inputs.
std::vector<int32_t> WalshSpectrum(const Rows& rows);

// Element s: in how many rows the function differenced by each input of s is 1, once for each pair
// of rows; for the empty set 0, as an inversion of the output would change it. Inversions change
// none of them. Requires: as above.
std::vector<uint32_t> DerivativeWeights(const Rows& rows);

} // namespace booleq

#endif
