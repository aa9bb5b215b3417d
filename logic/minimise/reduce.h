// REDUCE, IRREDUNDANT, ESSENTIAL PRIMES and LAST GASP of the classical loop (R. Brayton, G.
// Hachtel, C. McMullen, A. Sangiovanni-Vincentelli, Logic Minimization Algorithms for VLSI
// Synthesis, 1984; R. Rudell, Multiple-valued logic minimization for PLA synthesis, 1986).
#ifndef BOOLEQ_MINIMISE_REDUCE_H
#define BOOLEQ_MINIMISE_REDUCE_H

#include "expand.h"

namespace booleq {

// Each cube in turn becomes as small as the others, in their current state, allow. If 'isBySize',
// the largest come first; otherwise the largest one and then the cubes nearest to it.
void ReduceCover(const CubeSpace& space, Cover& cover, const CubeList& free, bool isBySize,
                 Work& work);

// Removes cubes so that the rest and 'free' still cover the same rows at the least cost: the number
// of cubes, then of literals.
void MakeIrredundant(const CubeSpace& space, Cover& cover, const CubeList& free, Work& work);

// Flags the cubes that no other prime can replace.
// Requires: all cubes are primes; cubes and 'free' cover what is on and not free, and nothing off.
std::vector<uint8_t> FindEssential(const CubeSpace& space, const CubeList& cubes,
                                   const CubeList& free, Work& work);

// Appends primes each of which covers two cubes of the cover after each has been reduced as if the
// others stayed as they are; returns their number.
size_t AddLastGasp(const CubeSpace& space, Expander& expander, Cover& cover, const CubeList& free,
                   Work& work);

// Removes outputs of cubes that others cover, then grows inputs as far as the remaining outputs
// allow.
void MakeSparse(const CubeSpace& space, Expander& expander, Cover& cover, const CubeList& free,
                Work& work);

} // namespace booleq

#endif
