// Two functions compared over all assignments, or over a sample where these are too many.
#ifndef BOOLEQ_DECIDE_WORD_COMPARISON_H
#define BOOLEQ_DECIDE_WORD_COMPARISON_H

#include <cstdint>
#include <vector>

#include "word_function.h"

namespace booleq {

struct Comparison {
    bool isEqual = true;
    bool isExhaustive = true;    // every assignment was tried
    uint64_t numAssignments = 0; // that were tried; a sample always tries the same ones
    std::vector<bool> first;     // values of the inputs where they differ; empty when equal
};

// Rows are tried in ascending order, so 'first' is the first row that differs, or, in a sample,
// some row that does. 'cost' is what a word takes, in operations; it decides what is too many.
Comparison CompareWords(const WordFunction& left, const WordFunction& right, unsigned int numInputs,
                        uint64_t cost);

} // namespace booleq

#endif
