// Shortest expressions of functions of few inputs, found by trying everything.
#ifndef BOOLEQ_SEARCH_SHORTEST_H
#define BOOLEQ_SEARCH_SHORTEST_H

#include "formula.h"
#include "rows.h"

namespace booleq {

constexpr unsigned int kMaxShortestInputs = 4;

// A formula of AND, OR, exclusive OR and inversions with as few literals as possible.
// Functions of 1, 2, 3, ... literals are made from all pairs of shorter ones until this one is
// found; with equally many literals, fewer exclusive ORs come first. Inversions are free, so a
// function and its inversion count as one.
// Requires: at most kMaxShortestInputs inputs matter.  Threads: any; they share one table.
Formula FindShortest(const Rows& function);

} // namespace booleq

#endif
