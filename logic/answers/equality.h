// Whether two equations are one function, and whether one ever has a value: by columns where one is
// an init value, otherwise by what they say.
#ifndef BOOLEQ_ANSWERS_EQUALITY_H
#define BOOLEQ_ANSWERS_EQUALITY_H

#include <Kq_BoolEquation.h>

#include "decision.h"

namespace booleq {

// Requires: both are set.
// Fails: Undecided as DecideEqual.
Decision DecideEquations(const Kq_BoolEquation& left, const Kq_BoolEquation& right,
                         const Limits& limits);

// Whether the equation always has the value: Different is an assignment where it has the other.
// Requires, Fails: as above.
Decision DecideValue(const Kq_BoolEquation& equation, bool value, const Limits& limits);

} // namespace booleq

#endif
