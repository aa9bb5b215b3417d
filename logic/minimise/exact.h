// The fewest terms, proved. Rows of the covering problem are rows of the function, none of which
// follows from another one (signatures, see blocking.h); columns are products that hold different
// rows. The covering problem is then solved by branch and bound.
#ifndef BOOLEQ_MINIMISE_EXACT_H
#define BOOLEQ_MINIMISE_EXACT_H

#include "two_level.h"

namespace booleq {

enum class Goal { Terms, Literals }; // what counts first; the other one breaks ties

struct ExactResult {
    explicit ExactResult(const CubeSpace& space) : sum(space.NumWords()) {}
    CubeList sum;                // of primes; the best one known
    size_t lowerBound = 0;       // no sum has fewer of what counts first
    bool isProved = false;       // the sum has exactly that many
    bool isSecondProved = false; // and no such sum has fewer of what counts second
};

// 'start' is an irredundant sum to improve on. When the work's limits end the search, the result is
// what is known then.
ExactResult FindSmallestSum(const TwoLevelProblem& problem, const CubeList& start, Goal goal,
                            Work& work);

} // namespace booleq

#endif
