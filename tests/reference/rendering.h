// Tree to text in one of four syntaxes.
#ifndef REFERENCE_RENDERING_H
#define REFERENCE_RENDERING_H

#include <string>
#include <vector>

#include "reference/node.h"

namespace reference {

// 'syntax' 0 writes tokens as typed; 'spaces' puts one blank between tokens.
std::string RenderTree(const std::vector<Node>& nodes, int root, int syntax, bool spaces);

} // namespace reference

#endif
