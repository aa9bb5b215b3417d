// Init values as text: a column of results to "0x..." and "0b...", and back to an expression.
#ifndef REFERENCE_INIT_TEXT_H
#define REFERENCE_INIT_TEXT_H

#include <string>
#include <vector>

namespace reference {

// 'column' holds the result of row k at position k.
std::string HexInitValue(const std::vector<unsigned int>& column, bool upperCase);
std::string BinaryInitValue(const std::vector<unsigned int>& column);

// The expression that an init value stands for over the variables 'names'; empty if the text is not
// an init value. With 'firstIsLowest' the first variable is bit 0 of the row number instead of the
// highest.
std::string ReadInitValue(const std::string& text, const std::vector<std::string>& names,
                          bool firstIsLowest);

} // namespace reference

#endif
