// The init value of a function in both orders of bits, side by side.
#ifndef BOOLEQ_BIT_ORDERS_H
#define BOOLEQ_BIT_ORDERS_H

#include "answer.h"
#include "function.h"
#include "output.h"

namespace booleq {

// Hexadecimal and binary digits, with the first input the most and the least significant. One input
// has one order. 'lsb' is the same function reversed.  Requires: an input at least.
void PutBitOrders(const Function& msb, const Function& lsb, Output& output);

// The digits of the order that hex and binary beside them do not have.
Json LsbFirstJson(const Function& function);

} // namespace booleq

#endif
