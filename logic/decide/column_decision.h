// Whether two columns are one function: for what has rows and no expression, such as init values.
#ifndef BOOLEQ_DECIDE_COLUMN_DECISION_H
#define BOOLEQ_DECIDE_COLUMN_DECISION_H

#include "decision.h"
#include "function.h"

namespace booleq {

// Different at the first row that differs, over the inputs of both; never Undecided.
// Requires: together at most kMaxFunctionInputs inputs.  Cost: O(n * 2^n / 64) for n of them.
Decision DecideColumns(const Function& left, const Function& right);

} // namespace booleq

#endif
