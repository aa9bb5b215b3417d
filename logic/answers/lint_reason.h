// Why another notation reads a text as another function. In: this library's tree and the other
// one's. Out: one sentence.
// Cost: a comparison for every set of causes tried, of which there are at most 15.
#ifndef BOOLEQ_ANSWERS_LINT_REASON_H
#define BOOLEQ_ANSWERS_LINT_REASON_H

#include <functional>
#include <string>

#include "expression.h"
#include "foreign_tree.h"

namespace booleq {

// Whether the other notation, if it read the text as this tree, would have this library's function.
typedef std::function<bool(const ForeignTree& tree)> Agreement;

// Names what differs there: the one cause that, if undone, makes the notation agree; if there is no
// such cause, the fewest that do so together.
// Requires: 'tree' is what the notation reads from the text of 'expression', with its names in the
// same order, and the two differ.
std::string FindReason(const Expression& expression, const ForeignTree& tree,
                       const Agreement& agrees);

} // namespace booleq

#endif
