// What a function is, in words that engineers use.
#ifndef BOOLEQ_SEARCH_KIND_H
#define BOOLEQ_SEARCH_KIND_H

#include <string>
#include <vector>

#include "function.h"

namespace booleq {

struct FunctionKind {
    std::vector<std::string> mattering;
    std::vector<std::string> idle; // inputs that change nothing
    std::string kind;              // "multiplexer", "AND", ...; empty if it has no name
    std::string text;              // the kind with its inputs; an inverted one is "~A"
};

// Requires: at most kMaxKindInputs inputs.
constexpr size_t kMaxKindInputs = 16;
FunctionKind FindKind(const Function& function);

} // namespace booleq

#endif
