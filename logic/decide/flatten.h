// An expression becomes an edge of a gate graph. Operators that are one associative operator in a
// row, also across inversions, are one list of operands: so their order and their parentheses
// leave no trace. Fails: std::bad_alloc, or what the watcher throws. Costs O(n log n) for n nodes.
#ifndef BOOLEQ_DECIDE_FLATTEN_H
#define BOOLEQ_DECIDE_FLATTEN_H

#include <vector>

#include "expression.h"
#include "gate_graph.h"

namespace booleq {

// 'inputs' are the edges that the expression's inputs stand for.
Edge AddExpression(const Expression& expression, const std::vector<Edge>& inputs, GateGraph& graph);

} // namespace booleq

#endif
