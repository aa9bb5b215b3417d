// A function given as code that computes it for 64 assignments at a time, and its column.
#ifndef BOOLEQ_COLUMN_WORD_FUNCTION_H
#define BOOLEQ_COLUMN_WORD_FUNCTION_H

#include <cstdint>
#include <functional>
#include <string>
#include <vector>

#include "function.h"

namespace booleq {

// The values for 64 assignments: element k of the argument holds input k's values, one in each bit.
typedef std::function<uint64_t(const std::vector<uint64_t>&)> WordFunction;

// The function over the inputs, found by trying every assignment.
// Requires: at most kMaxFunctionInputs inputs.  Cost: 2^inputs / 64 calls.
Function Tabulate(const WordFunction& function, const std::vector<std::string>& inputs);

} // namespace booleq

#endif
