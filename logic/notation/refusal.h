// A refusal for people: the library's code and place, a reason in one sentence, and a hint if the
// text shows what was meant.
#ifndef BOOLEQ_NOTATION_REFUSAL_H
#define BOOLEQ_NOTATION_REFUSAL_H

#include <string>

#include "listed_inputs.h"

namespace booleq {

struct RefusalReport {
    const char* code = nullptr; // a stable word, "operand" or "quote"; null: accepted
    size_t offset = 0;          // bytes, from 0
    size_t length = 0;
    std::string reason; // one sentence without a full stop
    std::string hint;   // what to write instead; empty when the text does not show it
};

// Why the text is refused when it is read as 'reading' says.
RefusalReport ExplainRefusal(const std::string& text, const Reading& reading);

// The line of the text that holds the place, and a line of '^' below it. Both are cut to fit a
// terminal, begin with 'indent' and end with a line feed. Bytes that are not printable become \xNN.
std::string MarkPlace(const std::string& text, size_t offset, size_t length,
                      const std::string& indent);
// "character 3", or "line 2, character 3" in a text of several lines; characters are bytes, from 1.
std::string PlaceName(const std::string& text, size_t offset);

} // namespace booleq

#endif
