// What there is to say of a function: its name, idle inputs and a short expression, as text.
#ifndef BOOLEQ_ANSWERS_DESCRIBE_H
#define BOOLEQ_ANSWERS_DESCRIBE_H

#include <cstddef>
#include <string>
#include <vector>

#include "function.h"

namespace booleq {

struct Description {
    std::string fault;             // not empty: there is none, and why
    std::vector<std::string> idle; // inputs that change nothing
    std::string kind;              // "multiplexer", "AND", ...; empty for one without a name
    std::string text;              // the kind with its inputs
    std::string expression; // in the library's first syntax, with clear parentheses; empty when
                            // none of bearable length was found
    size_t numOperands = 0; // how often it mentions inputs
    bool isMinimal = false; // proved: none mentions them fewer times
};

// Fails: fault, for more than kMaxKindInputs inputs.
Description Describe(const Function& function);

} // namespace booleq

#endif
