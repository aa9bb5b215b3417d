// The proof of an answer: whether a sum of products is the function that a table asks for.
#ifndef BOOLEQ_MINIMISE_PROOF_H
#define BOOLEQ_MINIMISE_PROOF_H

#include "pla.h"

namespace booleq {

// Whether the sum, or its inversion if 'isInverted', is 1 where the table is on and not free, and 0
// where it is off.
bool IsSumOf(const Pla& table, const CubeList& sum, bool isInverted, Work& work);

} // namespace booleq

#endif
