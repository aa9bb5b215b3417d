// Spellings of other languages in a text that is refused, and what to write for them in this
// library's syntax.
// In: a text and the place of its refusal. Out: what to write instead.
// Cost: a look around the place.
#ifndef BOOLEQ_NOTATION_FOREIGN_SPELLING_H
#define BOOLEQ_NOTATION_FOREIGN_SPELLING_H

#include <cstddef>
#include <string>

#include "listed_inputs.h"

namespace booleq {

// Empty if there is no known spelling at the place.
std::string HintForForeign(const std::string& text, size_t offset, const Reading& reading);

} // namespace booleq

#endif
