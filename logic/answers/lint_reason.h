// Why another notation reads a text as another function. In: this library's tree and the other's;
// out: one sentence.  Cost: a comparison for every cause tried, of which there are at most 15.
#ifndef BOOLEQ_ANSWERS_LINT_REASON_H
#define BOOLEQ_ANSWERS_LINT_REASON_H

#include <functional>
#include <string>

#include "expression.h"
#include "foreign_tree.h"

namespace booleq {

// Whether the other notation, read as this tree, has this library's function.
typedef std::function<bool(const ForeignTree& tree)> Agreement;

// Names what is different there: the cause that, undone alone, makes the notation agree; where no
// single one does, as few as do so together.
// Requires: 'tree' is what the notation reads of the text that 'expression' was read from, with its
// names in the same order, and the two differ.
std::string FindReason(const Expression& expression, const ForeignTree& tree,
                       const Agreement& agrees);

} // namespace booleq

#endif
