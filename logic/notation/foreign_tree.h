// A text read as another notation would read it: its tree, and what that says bit by bit.
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
    std::vector<std::string> names; // as the notation knows them: escapes and case taken away
};

// Reads 'text'. Names are added to tree.names as they come.
// Fails: false for a text that the notation does not have; 'fault' says why, in one sentence.
// Cost: in step with the text, and with the number of names; no recursion.
bool Read(const std::string& text, const Notation& notation, ForeignTree& tree, std::string& fault);

// What ForeignTree::names holds for a name as a target spells it.
std::string CanonicalName(const Notation& notation, const std::string& spelled);

// The same function as operators on bits, over the tree's names.
// Fails: false where values are wider than a bit and that shows in the result.
bool ToExpression(const ForeignTree& tree, Expression& expression);

// The function of the tree for inputs 0 or 1, exact also where values are wider. inputs[k] belongs
// to tree name k.  Requires: the tree outlives the function.
WordFunction ToWordFunction(const ForeignTree& tree);

// The same function to be decided about, exact in the same way.
// Requires: the tree outlives the side.
Side SideOf(const ForeignTree& tree);

// With parentheses around every operation, in the notation's own operators.
std::string WriteWhole(const ForeignTree& tree, const std::vector<std::string>& names);

} // namespace booleq

#endif
