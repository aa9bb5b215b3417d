// A small sum of a table with so few rows that each can be visited: the classical loop, with counts
// of what covers each row instead of questions about cubes.
#ifndef BOOLEQ_MINIMISE_ROW_SUM_H
#define BOOLEQ_MINIMISE_ROW_SUM_H

#include "row_table.h"

namespace booleq {

// An irredundant cover. Repeatable unless the work has a deadline, which can end the search early.
// Cost: about as many steps as there are rows in all terms, times inputs.
CubeList FindSumOfRows(const CubeSpace& space, const RowTable& rows, Work& work);

} // namespace booleq

#endif
