// An expression becomes an edge of a gate graph. A run of one associative operator, also across
// inversions, becomes one list of operands, so the order and the parentheses of operands leave no
// trace.
// Fails: std::bad_alloc, or what the watcher throws.  Cost: O(n log n) for n nodes.
#ifndef BOOLEQ_DECIDE_FLATTEN_H
#define BOOLEQ_DECIDE_FLATTEN_H

#include <vector>

#include "expression.h"
#include "gate_graph.h"

namespace booleq {

// 'inputs' are the edges for the expression's inputs.
Edge AddExpression(const Expression& expression, const std::vector<Edge>& inputs, GateGraph& graph);

} // namespace booleq

#endif
