// Whether two equations are one function: by columns where one is an init value, otherwise by what
// they say.
#ifndef BOOLEQ_ANSWERS_EQUALITY_H
#define BOOLEQ_ANSWERS_EQUALITY_H

#include <string>

#include <Kq_BoolEquation.h>

#include "decision.h"

namespace booleq {

// Requires: both are set.
// Fails: Undecided as DecideEqual.
Decision DecideEquations(const Kq_BoolEquation& left, const Kq_BoolEquation& right,
                         const Limits& limits);

// "not decided in 10 seconds", or "not decided: " and the reason.
// Requires: the decision is undecided, under these limits.
std::string UndecidedText(const Decision& decision, const Limits& limits);

} // namespace booleq

#endif
