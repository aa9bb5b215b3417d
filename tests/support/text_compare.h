// One text through library and model, with every question that both can answer.
#ifndef SUPPORT_TEXT_COMPARE_H
#define SUPPORT_TEXT_COMPARE_H

#include <string>

namespace support {

// Compares acceptance, messages, tree, renderings, variables, results, node evaluation over 32-bit
// tables, and what the rendering reads back as; "" or the first difference. 'seed' chooses the
// tables.
std::string CompareText(unsigned int seed, const std::string& text);

// Removes pieces of a text that differs, long ones first, as long as it still differs.
std::string ShrinkText(unsigned int seed, std::string text);

} // namespace support

#endif
