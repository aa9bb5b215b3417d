// Init values that people write and the library does not read: with a size (8'hca, 8'b1100_1010),
// and one hexadecimal digit over one input (0x2).
// In: a text over listed inputs. Out: the same rows as the library's 0x... or 0b..., or why not.
// Cost: one pass over the text.
#ifndef BOOLEQ_EXPRESSION_INIT_LITERAL_H
#define BOOLEQ_EXPRESSION_INIT_LITERAL_H

#include <cstddef>
#include <string>

namespace booleq {

struct InitLiteral {
    std::string text;           // for the library; the text as given if it is neither
    const char* code = nullptr; // if not null: refused, with the code of the refusal
    size_t offset = 0;          // bytes, from 0
    size_t length = 0;
    std::string reason;
    std::string hint;
};

// Digits that a sized value leaves out are 0; its size must be the number of rows of the inputs.
InitLiteral ReadInitLiteral(const std::string& text, size_t numInputs);

// Whether the text is a sized literal of any base, "N'...".
bool IsSizedLiteral(const std::string& text);

} // namespace booleq

#endif
