// A short expression for a function.
//
// Up to four inputs that matter, all expressions are tried (shortest.h), so nothing is shorter.
// With more, the function is taken apart: where it is an AND, OR or exclusive OR of functions
// without a common input, by these, which is found by quantifying over one side; otherwise by the
// best of a factored sum of products (cover.h) of it or its inversion and an expansion by one
// input. That is greedy, and need not end at the shortest.
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

// Proved equal to the function, row by row, before it is given out.
// Requires: at most kMaxShortFormInputs inputs.
ShortForm FindShortForm(const Function& function);

} // namespace booleq

#endif
