// What a node's dump prints: path names, headers, indented node lines.
#ifndef REFERENCE_NODE_DUMP_H
#define REFERENCE_NODE_DUMP_H

#include <string>
#include <vector>

#include "reference/node.h"

namespace reference {

// "TOP." and a letter for each step down, as far as parent and child links agree.
std::string PathName(const std::vector<Node>& nodes, int node);

// The whole subtree.
void DumpNode(const std::vector<Node>& nodes, int node);

// The dump of a node that broke a build: at most 256 node lines, then "NODE: ...\n".
void DumpFailure(const std::vector<Node>& nodes, int node);

} // namespace reference

#endif
