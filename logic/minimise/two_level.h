// Sums of products for several outputs at once: the problem, and the heuristic search for a small
// answer. Input: what is on, free and off, as cubes. Output: a cover with as few terms, then as few
// literals, as the search finds. It is not proved here; Minimise (sum.h) proves every answer.
#ifndef BOOLEQ_MINIMISE_TWO_LEVEL_H
#define BOOLEQ_MINIMISE_TWO_LEVEL_H

#include "cube.h"
#include "work.h"

namespace booleq {

// Invariants: for each output every row is in 'on', 'free' or 'off'; 'off' meets neither of the
// others; rows in both 'on' and 'free' are free. Without 'hasOff', the list 'off' is empty, and a
// row is off if it is in neither of the others.
struct TwoLevelProblem {
    explicit TwoLevelProblem(const CubeSpace& itsSpace)
        : space(itsSpace), on(space.NumWords()), free(space.NumWords()), off(space.NumWords())
    {
    }
    CubeSpace space;
    CubeList on;
    CubeList free;
    CubeList off;
    bool hasOff = true;
};

struct CoverCost {
    size_t numTerms;
    size_t numLiterals;
};

CoverCost CostOf(const CubeSpace& space, const CubeList& cubes);
bool IsCheaper(const CoverCost& left, const CoverCost& right);

// A cover by the classical loop. Repeatable: the same problem gives the same cover, unless the work
// has a deadline. True if the loop reached its end; then the cover is irredundant. Otherwise,
// because of a deadline or because the problem is too large, it is the cover reached so far, in
// which cubes may be as given.
bool FindSmallSum(const TwoLevelProblem& problem, Work& work, CubeList& sum);

// Removes outputs that other cubes cover, then inputs that the remaining outputs do not need: fewer
// literals for the same terms.
void ShedOutputs(const TwoLevelProblem& problem, CubeList& cubes, Work& work);

} // namespace booleq

#endif
