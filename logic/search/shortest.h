// Shortest expressions of functions of few inputs, found by trying everything.
#ifndef BOOLEQ_SEARCH_SHORTEST_H
#define BOOLEQ_SEARCH_SHORTEST_H

#include "formula.h"
#include "rows.h"

namespace booleq {

constexpr unsigned int kMaxShortestInputs = 4;

// A formula of AND, OR, exclusive OR and inversions with as few literals as there can be.
// Functions of 1, 2, 3, ... literals are made of all pairs of shorter ones until this one is there;
// with as many literals, fewer exclusive ORs come first. Inversions are free, so a function and its
// inversion are one.
// Requires: at most kMaxShortestInputs inputs matter.
Formula FindShortest(const Rows& function);

} // namespace booleq

#endif
