// Functions of up to six inputs as one word of rows, and their covers by Minato's recursion (S.
// Minato, Fast generation of prime-irredundant covers from binary decision diagrams, 1993). Bit k
// of a row's number is input k, so BitPattern(k) has the rows in which it is 1.
#ifndef BOOLEQ_MINIMISE_SMALL_COVER_H
#define BOOLEQ_MINIMISE_SMALL_COVER_H

#include <cstddef>
#include <cstdint>
#include <vector>

#include "rows.h"

namespace booleq {

constexpr size_t kWordInputs = 6; // the rows of so many inputs fit a word

// Bit k of 'zeros' or 'ones' says that the product needs input k to be 0 or 1.
struct SmallCube {
    uint8_t zeros;
    uint8_t ones;
};

// Appends an irredundant cover of 'rows' by primes; inputs from 'numInputs' on must not matter.
void FindSmallCover(uint64_t rows, size_t numInputs, std::vector<SmallCube>& cubes);

} // namespace booleq

#endif
