// Spellings of other languages where a text is refused, and what this library's syntax has for
// them. In: a text and the place of its refusal; out: what to write instead.  Cost: a look around
// the place.
#ifndef BOOLEQ_NOTATION_FOREIGN_SPELLING_H
#define BOOLEQ_NOTATION_FOREIGN_SPELLING_H

#include <cstddef>
#include <string>

#include "listed_inputs.h"

namespace booleq {

// Empty where nothing known stands at the place.
std::string HintForForeign(const std::string& text, size_t offset, const Reading& reading);

} // namespace booleq

#endif
