// The truth table as text, row by row; never held as a whole.
#ifndef BOOLEQ_TABLE_H
#define BOOLEQ_TABLE_H

#include <cstdint>

#include <Kq_BoolEquation.h>

#include "output.h"

namespace booleq {

constexpr unsigned int kMaxTableInputs = 30; // the library has no table above

// True when a column bears its number, "#2", because the input's name is long or not printable.
bool HasNumberedColumn(const Kq_BoolEquation& equation);

// Prints header and rows 0 to maxRows - 1, and says how many more there are.
// Requires: 1 to kMaxTableInputs variables. Their values are changed.
// Cost: one evaluation for each printed row, or the packed column (2^n / 64 evaluations, 2^n / 4
// bytes) where that is less.
void PrintTable(Kq_BoolEquation& equation, uint64_t maxRows, Output& output);

} // namespace booleq

#endif
