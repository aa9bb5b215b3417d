// The distinct tables of an array. In: tables; out: each that is there once, how often, and which
// of them every table is.
// Fails: std::bad_alloc, and what Watch() throws.  Cost: a look into a table of hashes each, and
// the sorting of those that are distinct.
#ifndef BOOLEQ_LUTS_DISTINCT_LUTS_H
#define BOOLEQ_LUTS_DISTINCT_LUTS_H

#include <vector>

#include "lut_array.h"

namespace booleq {

// Invariant: firstPlaces and counts have an element for each distinct table, in ascending order of
// the tables as numbers.
struct DistinctLuts {
    std::vector<uint64_t> words;       // the tables as LutsOf takes them: two words of seven inputs
    std::vector<uint64_t> firstPlaces; // in the array
    std::vector<uint64_t> counts;      // they add up to the array's
};

// 'distinctPlaces', if it is not null, gets for each table its place among the distinct ones.
DistinctLuts FindDistinctLuts(const LutArray& luts, uint64_t* distinctPlaces = nullptr);

} // namespace booleq

#endif
