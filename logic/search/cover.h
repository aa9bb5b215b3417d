// Functions as sums of products, found by Minato's and Morreale's recursion: each product is a
// prime, and none can be left out. It is fast, but does not always find the fewest products. If no
// input makes the function both rise and fall, there is only one such sum.
#ifndef BOOLEQ_SEARCH_COVER_H
#define BOOLEQ_SEARCH_COVER_H

#include <cstdint>
#include <vector>

#include "rows.h"

namespace booleq {

// A product of inputs: input k takes part if bit k of 'used' is set, and must then have the value
// of bit k of 'values'.
struct Cube {
    uint32_t used;
    uint32_t values;
};

constexpr unsigned int kMaxCoverInputs = 16;

// No product for the constant 0; one product without inputs for the constant 1.
// Requires: at most kMaxCoverInputs inputs.
std::vector<Cube> FindCover(const Rows& function);
// CountLiterals(FindCover(function)), without the products.  Requires: as above.
size_t CountCoverLiterals(const Rows& function);

size_t CountLiterals(const std::vector<Cube>& cubes);

} // namespace booleq

#endif
