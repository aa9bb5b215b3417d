// Node list in, checked tree out.
#ifndef KQ_BUILDER_H
#define KQ_BUILDER_H

#include <vector>

#include <Kq_BoolEquationImpNode.h>

struct KqBuildResult {
    Kq_BoolEquationImp::Node* root = nullptr; // of the whole, checked tree; null without one
    // Without a tree: the node to dump, null when nothing is to be dumped; why there is no tree;
    // and the token, in text order, that is to blame.
    const Kq_BoolEquationImp::Node* broken = nullptr;
    Kq_BoolEquation::Refusal::CODE refusal = Kq_BoolEquation::Refusal::NONE;
    size_t refusedPosition = 0;
};

// Links the nodes into a tree: operands hang below what precedes them, an operator takes the whole
// run of operators before it, all of one precedence, as its left operand. With 'isTraced', and
// while the debug mode is on, the tree so far is dumped before each placement and after the last.
// Requires: loose nodes, at least one, side by side in the order of the list.
// Fails: the result says so, and links are those of the attempt; std::bad_alloc, or what a
// message's receiver throws.  Cost: O(nodes); a walk up is paid for by the nodes that then lie
// below the new operator.
KqBuildResult KqBuildTree(const std::vector<Kq_BoolEquationImp::Node*>& list, bool isTraced);

#endif
