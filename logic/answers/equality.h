// Whether two equations are the same function, and whether one always has a value: by columns if
// one is an init value, otherwise by their expressions.
#ifndef BOOLEQ_ANSWERS_EQUALITY_H
#define BOOLEQ_ANSWERS_EQUALITY_H

#include <Kq_BoolEquation.h>

#include "decision.h"

namespace booleq {

// Requires: both are set.
// Fails: Undecided, as in DecideEqual.
Decision DecideEquations(const Kq_BoolEquation& left, const Kq_BoolEquation& right,
                         const Limits& limits);

// Whether the equation always has the value; Different gives an assignment for which it does not.
// Requires, Fails: as above.
Decision DecideValue(const Kq_BoolEquation& equation, bool value, const Limits& limits);

} // namespace booleq

#endif
