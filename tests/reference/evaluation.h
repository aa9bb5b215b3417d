// The value of a subtree for a table of 32-bit values.
#ifndef REFERENCE_EVALUATION_H
#define REFERENCE_EVALUATION_H

#include <vector>

#include "reference/node.h"

namespace reference {

// 'values' has entry k for variable k; an index beyond its end reads as 0. Values are not limited
// to 0 and 1. In debug mode every visited node is traced, children first.
unsigned int EvalTree(const std::vector<Node>& nodes, int root,
                      const std::vector<unsigned int>& values);

} // namespace reference

#endif
