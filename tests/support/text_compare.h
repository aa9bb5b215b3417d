// One text through library and model, with everything that can be asked of it.
#ifndef SUPPORT_TEXT_COMPARE_H
#define SUPPORT_TEXT_COMPARE_H

#include <string>

namespace support {

// Acceptance, messages, tree, renderings, variables, results, node evaluation over 32-bit tables,
// and what the rendering reads back as; "" or what differs first. 'seed' chooses the tables.
std::string CompareText(unsigned int seed, const std::string& text);

// Removes pieces of a text that differs, long ones first, while it still does.
std::string ShrinkText(unsigned int seed, std::string text);

} // namespace support

#endif
