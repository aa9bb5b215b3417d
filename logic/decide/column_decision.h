// Whether two columns are the same function: for functions with rows but no expression, such as
// init values.
#ifndef BOOLEQ_DECIDE_COLUMN_DECISION_H
#define BOOLEQ_DECIDE_COLUMN_DECISION_H

#include "decision.h"
#include "function.h"

namespace booleq {

// The result is Equal, or Different at the first row that differs, over the inputs of both; never
// Undecided.
// Requires: at most kMaxFunctionInputs inputs together.  Cost: O(n * 2^n / 64) for n inputs.
Decision DecideColumns(const Function& left, const Function& right);

} // namespace booleq

#endif
