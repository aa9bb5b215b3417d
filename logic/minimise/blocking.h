// What keeps a row of an output from growing into larger products: for each off cube a set of
// parts, one of which must stay out. Each smallest set of parts that meets all of these is what one
// prime that holds the row leaves out; parts in none of the smallest sets belong to all of its
// primes (P. McGeer, J. Sanghavi, R. Brayton, A. Sangiovanni-Vincentelli, ESPRESSO-SIGNATURE: a new
// exact minimizer for logic functions, 1993).
#ifndef BOOLEQ_MINIMISE_BLOCKING_H
#define BOOLEQ_MINIMISE_BLOCKING_H

#include "cube_columns.h"
#include "work.h"

namespace booleq {

// The sets of parts for which 'cube' would meet an off cube if all parts of the set were raised; no
// set contains another one. Requires: 'cube' meets no off cube.
CubeList FindBlockingSets(const CubeSpace& space, const CubeIndex& off, const uint64_t* cube,
                          Work& work);

// The parts that all primes that hold the cube have: those in no blocking set.
void FindSignature(const CubeSpace& space, const CubeList& blocking, uint64_t* signature);

// Appends the complements of all minimal sets that have a part in common with each of 'blocking',
// up to 'maxCount' of them: these are the primes if 'blocking' is that of one cube. Parts outside
// 'parts' count as chosen already. (K. Murakami, T. Uno, Efficient algorithms for dualizing
// large-scale hypergraphs, 2014.) False if there are more. Recursion: one level for each chosen
// part, at most inputs + outputs.
bool FindPrimes(const CubeSpace& space, const CubeList& blocking, const uint64_t* parts,
                size_t maxCount, Work& work, CubeList& primes);

} // namespace booleq

#endif
