// The causes of differences as sentences with the names of nets.
#ifndef BOOLEQ_INSPECT_CAUSE_TEXT_H
#define BOOLEQ_INSPECT_CAUSE_TEXT_H

#include <string>

#include "comparison.h"

namespace booleq {

// A sentence without a capital or a full stop. Names are written as in the file.
std::string CauseText(const Comparison& comparison, const Cause& cause);

} // namespace booleq

#endif
