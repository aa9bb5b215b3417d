// Whether two functions are one, over the inputs of both.
#ifndef BOOLEQ_DECIDE_EQUALITY_H
#define BOOLEQ_DECIDE_EQUALITY_H

#include <cstddef>
#include <cstdint>
#include <string>
#include <vector>

#include "function.h"

namespace booleq {

struct Equality {
    std::string fault;               // not empty: nothing was compared, and why
    std::vector<std::string> inputs; // those of the first, then what only the second has
    uint64_t row = Function::kNoRow; // the first that differs, over 'inputs'
    bool left = false;               // the values there
    bool right = false;

    bool IsEqual() const { return row == Function::kNoRow; }
    uint64_t NumRows() const { return uint64_t(1) << inputs.size(); }
    // The value of an input in the row that differs.
    bool InputAt(size_t index) const { return (row >> (inputs.size() - 1 - index) & 1u) != 0; }
};

// Fails: fault, for more than kMaxFunctionInputs inputs together.
Equality CompareFunctions(const Function& left, const Function& right);

} // namespace booleq

#endif
