// Small expressions while they are searched for: operators take any number of operands, inversions
// stand anywhere, and only at the end it is settled how that is written best.
#ifndef BOOLEQ_SEARCH_FORMULA_H
#define BOOLEQ_SEARCH_FORMULA_H

#include <cstddef>
#include <string>
#include <vector>

#include "expression.h"

namespace booleq {

struct Formula {
    Operator op = Operator::Zero; // Zero, One, Input, Not, And, Or or Xor
    uint32_t input = 0;
    std::vector<Formula> operands; // one of Not, two or more of the others
};

Formula MakeConstant(bool value);
Formula MakeInput(uint32_t input);
// The inversion; constants and inversions of inversions are taken away.
Formula MakeNot(Formula operand);
// And, Or or Xor of two formulas that are no constants; a chain of one operator becomes one.
Formula Join(Operator op, Formula left, Formula right);

// Inputs as they are written, repeated ones counted again.
size_t CountLiterals(const Formula& formula);

// The formula written for people: with the fewest inversions (a NAND counts as one), operands in
// the order of their inputs, as binary operators. 'names' are those of the inputs.
// Cost: the recursion is as deep as the formula, which is small.
Expression ToExpression(const Formula& formula, const std::vector<std::string>& names);

} // namespace booleq

#endif
