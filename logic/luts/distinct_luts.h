// The distinct tables of an array. In: tables; out: each distinct table once, how often it occurs,
// and which of them every table is.
// Fails: std::bad_alloc, and what Watch() throws.  Cost: one look-up in a hash table for each
// table, and sorting the distinct ones.
#ifndef BOOLEQ_LUTS_DISTINCT_LUTS_H
#define BOOLEQ_LUTS_DISTINCT_LUTS_H

#include <vector>

#include "lut_array.h"

namespace booleq {

// Invariant: firstPlaces and counts have an element for each distinct table, in ascending order of
// the tables as numbers.
struct DistinctLuts {
    std::vector<uint64_t> words; // the tables as LutsOf takes them: seven inputs have two words
    std::vector<uint64_t> firstPlaces; // in the array
    std::vector<uint64_t> counts;      // their sum is the number of tables in the array
};

// 'distinctPlaces', if not null, gets each table's place among the distinct ones.
DistinctLuts FindDistinctLuts(const LutArray& luts, uint64_t* distinctPlaces = nullptr);

} // namespace booleq

#endif
