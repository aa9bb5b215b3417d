// Functions of up to six inputs as one word of rows, and their covers by Minato's recursion (S.
// Minato, Fast generation of prime-irredundant covers from binary decision diagrams, 1993).
#ifndef BOOLEQ_MINIMISE_SMALL_COVER_H
#define BOOLEQ_MINIMISE_SMALL_COVER_H

#include <cstddef>
#include <cstdint>
#include <vector>

namespace booleq {

constexpr size_t kWordInputs = 6; // inputs whose rows fit a word

// The rows in which each input is 1: bit k of the row number is input k.
constexpr uint64_t kInputRows[kWordInputs] = {0xaaaaaaaaaaaaaaaau, 0xccccccccccccccccu,
                                              0xf0f0f0f0f0f0f0f0u, 0xff00ff00ff00ff00u,
                                              0xffff0000ffff0000u, 0xffffffff00000000u};

// Bit k of 'zeros' or 'ones' says that the product needs input k to be 0 or 1.
struct SmallCube {
    uint8_t zeros;
    uint8_t ones;
};

// Appends an irredundant cover of primes of the rows; inputs from 'numInputs' on must not matter.
void FindSmallCover(uint64_t rows, size_t numInputs, std::vector<SmallCube>& cubes);

} // namespace booleq

#endif
