// The init value of a function in both orders of bits, side by side.
#ifndef BOOLEQ_BIT_ORDERS_H
#define BOOLEQ_BIT_ORDERS_H

#include "answer.h"
#include "output.h"

namespace booleq {

// The same function with its inputs in the opposite order: what somebody sees who counts the first
// input as bit 0 of the row number.
kq_logic::Function Reversed(const kq_logic::Function& function);

// Hexadecimal and binary digits, with the first input as the most and as the least significant one.
// With one input there is one order. 'lsb' is the same function reversed.
// Requires: at least one input.
void PutBitOrders(const kq_logic::Function& msb, const kq_logic::Function& lsb, Output& output);

// The digits in the order that the members hex and binary next to them do not use.
Json LsbFirstJson(const kq_logic::Function& function);

} // namespace booleq

#endif
