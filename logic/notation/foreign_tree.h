// A text read as another notation would read it: its tree, and what that means bit by bit.
#ifndef BOOLEQ_NOTATION_FOREIGN_TREE_H
#define BOOLEQ_NOTATION_FOREIGN_TREE_H

#include <string>
#include <vector>

#include "decision.h"
#include "expression.h"
#include "notation.h"

namespace booleq {

// In post-order, like an Expression, but with the meanings of the notation.
struct ForeignTree {
    struct Node {
        Meaning meaning;
        uint32_t left; // node of the first operand; an input's number
        uint32_t right;
        const char* text; // of an operator
    };
    const Notation* notation = nullptr;
    std::vector<Node> nodes;
    std::vector<std::string> names; // as the notation tells them apart: without escapes and case
};

// Reads 'text'. New names are added to tree.names.
// Fails: false for a text that is not in the notation; 'fault' says why, in one sentence.
// Cost: in step with the text, and with the number of names; no recursion.
bool Read(const std::string& text, const Notation& notation, ForeignTree& tree, std::string& fault);

// The name in ForeignTree::names for a name as a target spells it.
std::string CanonicalName(const Notation& notation, const std::string& spelled);

// The same function with operators on bits, over the tree's names.
// Fails: false if values are wider than a bit and that affects the result.
bool ToExpression(const ForeignTree& tree, Expression& expression);

// The function of the tree for inputs 0 or 1; it is exact for wider values too. inputs[k] belongs
// to tree name k.  Requires: the tree outlives the function.
WordFunction ToWordFunction(const ForeignTree& tree);

// The same function as a side of a decision, exact in the same way.
// Requires: the tree outlives the side.
Side SideOf(const ForeignTree& tree);

// The tree with parentheses around every operation, in the notation's own operators.
std::string WriteWhole(const ForeignTree& tree, const std::vector<std::string>& names);

} // namespace booleq

#endif
