// Minimises a table: the entry for the tool and the module. A table of cubes enters; a sum of
// products for all outputs, or for their inversions, leaves, with what is proved about it. Every
// answer is checked against the table as given, by rows or by cube calculus, before it leaves.
#ifndef BOOLEQ_MINIMISE_SUM_H
#define BOOLEQ_MINIMISE_SUM_H

#include "exact.h"
#include "pla.h"

namespace booleq {

struct SumOptions {
    Goal goal = Goal::Terms;
    bool isExact = false;    // otherwise an exact search is only tried briefly
    bool isInverted = false; // the sum is for what is off; inverted, it is a product of sums
    double seconds = 0;      // for what follows the first sum; 0: no limit
};

struct Sum {
    explicit Sum(const CubeSpace& space) : cubes(space.NumWords()) {}
    CubeList cubes;
    CoverCost cost = {0, 0};
    size_t lowerBound = 0;       // no sum has fewer terms (literals, if these count first)
    bool isProved = false;       // this sum has no more
    bool isSecondProved = false; // and among such sums it has the fewest of the other
    bool isCutShort = false;     // the search ended early: terms may be as given
};

// Fails: false with the fault, if the table contradicts itself or needs too many cubes.
// Throws what the watcher throws, and std::logic_error if the proof of the answer fails, which is a
// mistake of ours.
bool Minimise(const Pla& table, const SumOptions& options, Sum& sum, PlaFault& fault, Work& work);

} // namespace booleq

#endif
