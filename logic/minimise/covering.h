// Covering: the cheapest columns of a table of zeros and ones such that every row has one of them.
// Reductions are the classical ones (E. McCluskey, Minimization of Boolean functions, 1956); bounds
// come from Lagrange multipliers (M. Held, R. Karp, The travelling-salesman problem and minimum
// spanning trees, 1971; J. Beasley, An algorithm for set covering problem, 1987), and reduced costs
// force columns in or out (O. Coudert, On solving covering problems, 1996).
#ifndef BOOLEQ_MINIMISE_COVERING_H
#define BOOLEQ_MINIMISE_COVERING_H

#include <cstddef>
#include <cstdint>
#include <vector>

#include "work.h"

namespace booleq {

// Invariant: no row is empty, the columns of a row ascend, each cost is 1 or more.
struct CoveringProblem {
    std::vector<uint64_t> costs;             // of each column
    std::vector<std::vector<uint32_t>> rows; // the columns that cover each row
};

struct CoveringResult {
    std::vector<uint32_t> columns; // ascending; they cover all rows
    uint64_t cost = 0;
    uint64_t lowerBound = 0; // no cover costs less; equal to 'cost' if that is proved
};

// Always returns a cover: when 'maxUnits' of work, or the work's own limits, are used up, it is the
// best cover so far with the bound so far. Exceptions of the watcher pass through.
CoveringResult SolveCovering(const CoveringProblem& problem, uint64_t maxUnits, Work& work);

// --- What the search is made of ---------------------------------------------------------------

// A problem in both directions, part of a larger one.
struct CoveringTable {
    std::vector<std::vector<uint32_t>> rows;    // columns of each row
    std::vector<std::vector<uint32_t>> columns; // rows of each column
    std::vector<uint64_t> costs;
    std::vector<uint32_t> ids;       // of the columns in the whole problem
    std::vector<double> multipliers; // of the rows
};

// Moves columns that a row cannot do without to 'forced' (by id), and drops rows that are covered
// or follow from others and columns that another one replaces at no more cost, until nothing
// changes.
void ReduceCovering(CoveringTable& table, std::vector<uint32_t>& forced, Work& work);
// Drops rows and columns whose flags are 0, and columns without rows.
void KeepInTable(CoveringTable& table, const std::vector<uint8_t>& isRowKept,
                 const std::vector<uint8_t>& isColumnKept);
// The parts of the table that have no column in common.
std::vector<CoveringTable> SplitTable(const CoveringTable& table);

} // namespace booleq

#endif
