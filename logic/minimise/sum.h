// Minimises a table: the way in for the tool and the module. A table of cubes goes in; a sum of
// products for all outputs, or for their inversions, comes out, with what is proved of it. Every
// answer has been checked against the table as it was given, by cube calculus, before it leaves.
#ifndef BOOLEQ_MINIMISE_SUM_H
#define BOOLEQ_MINIMISE_SUM_H

#include "exact.h"
#include "pla.h"

namespace booleq {

struct SumOptions {
    Goal goal = Goal::Terms;
    bool isExact = false;    // otherwise an exact search is only tried for a moment
    bool isInverted = false; // the sum is for what is off: inverted it is a product of sums
    double seconds = 0;      // for what follows the first sum; 0: as long as it takes
};

struct Sum {
    explicit Sum(const CubeSpace& space) : cubes(space.NumWords()) {}
    CubeList cubes;
    CoverCost cost = {0, 0};
    size_t lowerBound = 0;       // no sum has fewer terms (literals, if these count first)
    bool isProved = false;       // this one has no more
    bool isSecondProved = false; // and among those it has the fewest of the other
    bool isCutShort = false;     // the search ended early: terms may be as they were given
};

// Fails: false with the fault, for a table that contradicts itself.
// Throws what the watcher throws, and std::logic_error if the proof of the answer fails, which is a
// mistake of ours.
bool Minimise(const Pla& table, const SumOptions& options, Sum& sum, PlaFault& fault, Work& work);

} // namespace booleq

#endif
