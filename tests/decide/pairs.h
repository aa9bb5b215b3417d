// Pairs of expressions for testing decisions: a random one, and the same function written
// differently, or a slightly different function.
#ifndef TESTS_DECIDE_PAIRS_H
#define TESTS_DECIDE_PAIRS_H

#include <cstdint>
#include <random>

#include "expression.h"

namespace decide_pairs {

struct Pair {
    booleq::Expression left;
    booleq::Expression right;
    bool isRewritten; // right is left rewritten; otherwise one operator deep inside was changed
                      // first
};

// A tree of 'numOperators' binary operators, plus inversions, over inputs v0, v1, ...; constants
// are rare.
booleq::Expression RandomExpression(std::mt19937_64& random, uint32_t numInputs,
                                    uint32_t numOperators);

// The same function, changed by De Morgan's laws, double inversion, other orders and groupings,
// distribution, and expansion of exclusive-or; at most about four times as large.
booleq::Expression Rewrite(const booleq::Expression& expression, std::mt19937_64& random);

// The same tree except for one operator, chosen from those far from the root.
booleq::Expression ChangeOneOperator(const booleq::Expression& expression, std::mt19937_64& random);

// 'number' determines the pair. 20 to 'maxInputs' inputs.
Pair MakePair(uint64_t number, uint32_t maxInputs);

} // namespace decide_pairs

#endif
