// The value of a subtree for a table of 32-bit values.
#ifndef REFERENCE_EVALUATION_H
#define REFERENCE_EVALUATION_H

#include <vector>

#include "reference/node.h"

namespace reference {

// 'values' holds entry k for variable k; an index beyond it reads as 0. Values are not forced to 0
// or 1. In debug mode every node visited is traced, children first.
unsigned int EvalTree(const std::vector<Node>& nodes, int root,
                      const std::vector<unsigned int>& values);

} // namespace reference

#endif
