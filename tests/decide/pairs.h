// Pairs of expressions for whoever decides whether they are one function: random ones, and the same
// written in another way.
#ifndef TESTS_DECIDE_PAIRS_H
#define TESTS_DECIDE_PAIRS_H

#include <cstdint>
#include <random>

#include "expression.h"

namespace decide_pairs {

struct Pair {
    booleq::Expression left;
    booleq::Expression right;
    bool isRewritten; // right is left, rewritten; otherwise one operator deep inside was changed
                      // first
};

// A tree of 'numOperators' operators of two operands, inversions apart, over inputs v0, v1, ...;
// constants are rare.
booleq::Expression RandomExpression(std::mt19937_64& random, uint32_t numInputs,
                                    uint32_t numOperators);

// The same function: De Morgan, double inversion, other orders and groupings, distribution,
// exclusive or expanded; at most about four times as large.
booleq::Expression Rewrite(const booleq::Expression& expression, std::mt19937_64& random);

// The same tree but for one operator, chosen among those far from the root.
booleq::Expression ChangeOneOperator(const booleq::Expression& expression, std::mt19937_64& random);

// 'number' decides everything. Up to 'maxInputs' inputs, from 20 on.
Pair MakePair(uint64_t number, uint32_t maxInputs);

} // namespace decide_pairs

#endif
