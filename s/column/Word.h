// Packed results, 64 rows to a word: bit k % 64 of word k / 64 is the result of row k.
#ifndef KQ_WORD_H
#define KQ_WORD_H

#include <cstdint>

#include <Kq_BoolEquationImpNode.h>

// For each bit that tells rows of a word apart, the rows whose number has that bit set.
constexpr uint64_t kKqRowsWithBit[6] = {0xaaaaaaaaaaaaaaaau, 0xccccccccccccccccu,
                                        0xf0f0f0f0f0f0f0f0u, 0xff00ff00ff00ff00u,
                                        0xffff0000ffff0000u, 0xffffffff00000000u};

// How many bits are set, by adding up halves. Where the processor need not have the instruction,
// the compiler's built-in is a function call, which takes longer.
inline unsigned int KqCountBits(uint64_t bits)
{
    bits -= bits >> 1 & 0x5555555555555555u;
    bits = (bits & 0x3333333333333333u) + (bits >> 2 & 0x3333333333333333u);
    bits = (bits + (bits >> 4)) & 0x0f0f0f0f0f0f0f0fu;
    return static_cast<unsigned int>(bits * 0x0101010101010101u >> 56);
}

// The column of the tree at 'root' over up to six variables as one word, repeated up to its end.
// An ID whose index is not below 'numVariables' counts as 0; 'isComplete' tells whether there is
// none.
// Requires: a checked tree, null counting as 0.  Fails: std::bad_alloc.
// Cost: O(nodes), less than compiling.
uint64_t KqComputeWord(const Kq_BoolEquationImp::Node* root, unsigned int numVariables,
                       bool& isComplete);

#endif
