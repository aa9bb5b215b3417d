// A short expression for a function.
#ifndef BOOLEQ_SEARCH_SHORT_FORM_H
#define BOOLEQ_SEARCH_SHORT_FORM_H

#include "expression.h"
#include "function.h"

namespace booleq {

constexpr size_t kMaxShortFormInputs = 16;

struct ShortForm {
    bool isFound = false; // false: no expression short enough
    Expression expression;
    bool isMinimal = false; // proved: no expression of & | ^ ~ mentions inputs fewer times
    size_t numLiterals = 0; // how often inputs are mentioned
};

// Up to four inputs that matter, all expressions are tried (shortest.h), so none is shorter. With
// more, the function is taken apart. If it is an AND, OR or exclusive OR of functions without a
// common input, which quantifying over one side shows, it is split into these. Otherwise the best
// of three is taken: a factored sum of products (cover.h) of the function or of its inversion, and
// an expansion by one input. That is greedy and may miss the shortest.
// The expression is proved equal to the function, row by row, before it is returned.
// Requires: at most kMaxShortFormInputs inputs.
ShortForm FindShortForm(const Function& function);

} // namespace booleq

#endif
