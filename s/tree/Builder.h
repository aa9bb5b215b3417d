// Node list in, checked tree out.
#ifndef KQ_BUILDER_H
#define KQ_BUILDER_H

#include <vector>

#include <Kq_BoolEquationImpNode.h>

struct KqBuildResult {
    Kq_BoolEquationImp::Node* root = nullptr; // of the checked tree; null when there is none
    // When there is no tree: the node to dump, or null for no dump; why there is no tree; and the
    // position, in text order, of the token that is to blame.
    const Kq_BoolEquationImp::Node* broken = nullptr;
    Kq_BoolEquation::Refusal::CODE refusal = Kq_BoolEquation::Refusal::NONE;
    size_t refusedPosition = 0;
};

// Links the nodes into a tree: operands hang below what precedes them, and an operator takes the
// whole run of operators before it, all of one precedence, as its left operand. With 'isTraced',
// while debug mode is on, the tree so far is dumped before each placement and after the last.
// Requires: loose nodes, at least one, side by side in the order of the list.
// Fails: the result says so, and links stay as the attempt left them; std::bad_alloc, or what a
// message's receiver throws.  Cost: O(nodes); each walk up is paid for by the nodes that end up
// below the new operator.
KqBuildResult KqBuildTree(const std::vector<Kq_BoolEquationImp::Node*>& list, bool isTraced);

#endif
