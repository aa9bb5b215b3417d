// Small expressions during a search: operators take any number of operands, and inversions can be
// anywhere. Only the conversion at the end decides how that is written best.
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
// The inversion; constants and double inversions are simplified.
Formula MakeNot(Formula operand);
// And, Or or Xor of two formulas that are not constants; a chain of one operator becomes one
// operator.
Formula Join(Operator op, Formula left, Formula right);

// How often inputs are written; repeated ones are counted again.
size_t CountLiterals(const Formula& formula);

// The formula written for people: with the fewest inversions (a NAND counts as one), operands in
// the order of their inputs, as binary operators. 'names' are those of the inputs.
// Cost: the recursion is as deep as the formula, which is small.
Expression ToExpression(const Formula& formula, const std::vector<std::string>& names);

} // namespace booleq

#endif
