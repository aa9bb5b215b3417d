// Tree in, equation text out.
#ifndef KQ_RENDER_H
#define KQ_RENDER_H

#include <Kq_BoolEquationImpNode.h>

// What a node writes: its own token, or its type's spelling in a fixed syntax.
typedef const Port::StringBase<char>& (Kq_BoolEquationImp::Node::*KqSpellingOfNode)() const;

// The text of the tree at 'root', empty for null, with one blank between tokens if 'spaces'.
// Fails: std::bad_alloc.  Cost: O(text written); no recursion.
Port::StringBase<char> KqRender(const Kq_BoolEquationImp::Node* root, KqSpellingOfNode spelling,
                                bool spaces);

#endif
