// Why a text was refused, as far as the text alone shows it for certain.
#ifndef BOOLEQ_REFUSAL_H
#define BOOLEQ_REFUSAL_H

#include <string>

#include "core/reading.h"

namespace booleq {

// Reason and mend in one sentence, for a text that the library refused and that is not blank.
// Characters are counted from 1, in bytes.
std::string ExplainRefusal(const std::string& text, const Reading& reading);

} // namespace booleq

#endif
