// Token list to tree: places the tokens one by one, from left to right, then checks every node.
#ifndef REFERENCE_BUILDER_H
#define REFERENCE_BUILDER_H

#include <vector>

#include "reference/node.h"

namespace reference {

// Links 'nodes', which are in text order and not empty, and returns the root; kNone if the list is
// not an equation. Traces each step in debug mode, and dumps the node that breaks the tree.
int BuildTree(std::vector<Node>& nodes);

} // namespace reference

#endif
