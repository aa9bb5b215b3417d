// Whether two functions are the same apart from the order of inputs, from inversions, and from
// inputs without effect.
#ifndef BOOLEQ_SEARCH_MATCH_H
#define BOOLEQ_SEARCH_MATCH_H

#include <cstddef>
#include <vector>

#include "function.h"

namespace booleq {

// second(x) = first(y), inverted if isInverted, where y[sources[k]] is x[k], inverted if
// inverted[k]. Inputs without effect have no counterpart.
struct Matching {
    static constexpr unsigned int kIdle = static_cast<unsigned int>(-1);

    bool isFound = false;
    std::vector<unsigned int> sources;
    std::vector<bool> inverted;
    bool isInverted = false;
    bool isDecided = true; // false: the time ran out, and nothing was found
};

constexpr size_t kMaxMatchInputs = 16; // inputs with an effect

// The positions of the inputs that have an effect, ascending.
std::vector<unsigned int> EffectiveInputs(const Function& function);

// The search tells inputs apart by what neither order nor inversions change, and tries only those
// that it cannot tell apart. 'seconds' limits it; 0 means no limit.
// Requires: at most kMaxMatchInputs inputs with an effect in each.
// Cost: usually some milliseconds for 16 inputs; for functions that are almost symmetric it can
// take as many tries as there are orders.
Matching Match(const Function& first, const Function& second, bool allowInversions,
               double seconds = 0);

// What a matching makes of the first function, over the second's inputs: to prove the matching.
Function Apply(const Matching& matching, const Function& first,
               const std::vector<std::string>& inputs);

} // namespace booleq

#endif
