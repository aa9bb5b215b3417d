// A text of another notation as an expression of this library. In: the text; out: the expression,
// over names that this library has, or why not.  Fails: fault.
// Cost: in step with the text; where values are wider than a bit, a search over up to 8 inputs.
#ifndef BOOLEQ_ANSWERS_FOREIGN_TEXT_H
#define BOOLEQ_ANSWERS_FOREIGN_TEXT_H

#include <string>

#include "expression.h"
#include "foreign_tree.h"
#include "notation.h"

namespace booleq {

struct ForeignText {
    std::string fault; // not empty: one sentence, and there is no expression
    Expression expression;
};

// Names that are not words here, such as "a[0]", get single quotes.
ForeignText ReadForeignText(const std::string& text, const Notation& notation);

// What the tree says as operators on bits, over its names. Where values are wider than a bit and
// that shows, a short form of the function.
// Fails: false, in that case, with more than 8 inputs or where none short enough was found.
bool ToBits(const ForeignTree& tree, const WordFunction& function, Expression& expression);

} // namespace booleq

#endif
