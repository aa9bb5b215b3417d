// The init value of a function in both orders of bits, side by side.
#ifndef BOOLEQ_BIT_ORDERS_H
#define BOOLEQ_BIT_ORDERS_H

#include "answer.h"
#include "output.h"

namespace booleq {

// The same function with its inputs in opposite order: how somebody reads it who takes the first
// input for bit 0 of the row number.
kq_logic::Function Reversed(const kq_logic::Function& function);

// Hexadecimal and binary digits, with the first input the most and the least significant. One input
// has one order. 'lsb' is the same function reversed.  Requires: an input at least.
void PutBitOrders(const kq_logic::Function& msb, const kq_logic::Function& lsb, Output& output);

// The digits of the order that hex and binary beside them do not have.
Json LsbFirstJson(const kq_logic::Function& function);

} // namespace booleq

#endif
