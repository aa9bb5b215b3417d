// Equation text to a flat list of nodes, one for each token, in text order.
#ifndef REFERENCE_TOKENIZER_H
#define REFERENCE_TOKENIZER_H

#include <string>
#include <vector>

#include "reference/node.h"

namespace reference {

// Reads 'text' up to its first NUL. False if the text is refused; 'nodes' is then meaningless.
bool Tokenize(const std::string& text, std::vector<Node>& nodes);

} // namespace reference

#endif
