// What a function is, in words that engineers use.
#ifndef BOOLEQ_CORE_EXPLAIN_H
#define BOOLEQ_CORE_EXPLAIN_H

#include <string>
#include <vector>

#include "function.h"

namespace booleq {

struct Explanation {
    std::vector<std::string> mattering;
    std::vector<std::string> idle; // inputs that change nothing
    std::string kind;              // "multiplexer", "AND", ...; empty for one without a name
    std::string text;              // the kind with its inputs, an inverted one as "~A"
};

// Requires: at most kMaxExplainInputs inputs.
constexpr size_t kMaxExplainInputs = 16;
Explanation Explain(const Function& function);

} // namespace booleq

#endif
