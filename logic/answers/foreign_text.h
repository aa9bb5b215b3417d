// A text in another notation as an expression of this library.
// In: the text. Out: the expression, over names that this library has, or why there is none.
// Fails: fault.  Cost: in step with the text; if values are wider than a bit, a search over up to 8
// inputs.
#ifndef BOOLEQ_ANSWERS_FOREIGN_TEXT_H
#define BOOLEQ_ANSWERS_FOREIGN_TEXT_H

#include <string>

#include "expression.h"
#include "foreign_tree.h"
#include "notation.h"

namespace booleq {

struct ForeignText {
    std::string fault; // if not empty: one sentence, and no expression
    Expression expression;
};

// Names that are not words here, such as "a[0]", get single quotes.
ForeignText ReadForeignText(const std::string& text, const Notation& notation);

// What the tree means with operators on bits, over its names. If values are wider than a bit and
// that affects the result, it is a short form of the function.
// Fails: false in that case, with more than 8 inputs or if no form is short enough.
bool ToBits(const ForeignTree& tree, const WordFunction& function, Expression& expression);

} // namespace booleq

#endif
