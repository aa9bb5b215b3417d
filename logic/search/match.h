// Whether two functions are one up to the order of inputs, and up to inversions.
#ifndef BOOLEQ_SEARCH_MATCH_H
#define BOOLEQ_SEARCH_MATCH_H

#include <vector>

#include "function.h"

namespace booleq {

// second(x) = first(y), inverted if isInverted, where y[sources[k]] is x[k], inverted if
// inverted[k].
struct Matching {
    bool isFound = false;
    std::vector<unsigned int> sources;
    std::vector<bool> inverted;
    bool isInverted = false;
};

constexpr size_t kMaxMatchInputs = 16;

// A search that places one input after the other and goes on only where every cofactor has as many
// ones as its counterpart; inputs that trade places without a change are tried once.
// Requires: as many inputs in both, at most kMaxMatchInputs.
Matching Match(const Function& first, const Function& second, bool allowInversions);

// What a matching says of the first function, to prove it.
Function Apply(const Matching& matching, const Function& first,
               const std::vector<std::string>& inputs);

} // namespace booleq

#endif
