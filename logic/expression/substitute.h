// Expressions made of expressions: inputs replaced by others, constants folded, two joined.
// In: expressions, and where their inputs are among the new names. Out: one over the new names.
// Fails: std::length_error for a result of more nodes than an expression can number.
// Cost: in step with what is written; no recursion.
#ifndef BOOLEQ_EXPRESSION_SUBSTITUTE_H
#define BOOLEQ_EXPRESSION_SUBSTITUTE_H

#include <cstdint>
#include <string>
#include <vector>

#include "expression.h"

namespace booleq {

constexpr size_t kMaxExpressionNodes = size_t(1) << 30;

// What replaces an input: an expression, or another number for the input.
struct Substitute {
    const Expression* expression = nullptr; // null: the input stays, with the number in places[0]
    std::vector<uint32_t> places;           // where the expression's inputs are among the new names
};

// 'expression' with its input k replaced by substitutes[k], over 'names'.
// Requires: a substitute for each input; every expression has a node.
Expression Substituted(const Expression& expression, const std::vector<Substitute>& substitutes,
                       std::vector<std::string> names);

// The same function without constants inside: what a constant decides is left out. The result is a
// single constant, or contains none.  The names stay.
Expression Folded(const Expression& expression);

// 'left' and 'right' under a binary operator, which is spelled & | ^ or a negated form of these.
// The names are those of the left one, then those that only the right one has.
// Requires: both have a node.
Expression Joined(const Expression& left, Operator op, const Expression& right);

// Where each of 'names' is in 'all'; names that 'all' lacks are added at its end.
std::vector<uint32_t> Merge(const std::vector<std::string>& names, std::vector<std::string>& all);

// The names in order of their first occurrence in the text.
std::vector<std::string> NamesInText(const Expression& expression);

} // namespace booleq

#endif
