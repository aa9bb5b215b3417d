// Listed inputs: the names that a caller puts before an equation.
#ifndef KQ_TERMS_H
#define KQ_TERMS_H

#include <utility>
#include <vector>

#include <port/Port_StringBase.h>

typedef std::pair<Port::StringBase<char>, unsigned int> KqVariable; // a name and its value, 0 or 1

// The variables that the terms define, in their order or the opposite one, with value 0. A term
// that is not legal or occurs twice is skipped.
// Fails: std::bad_alloc.  Cost: in step with the names.
std::vector<KqVariable> KqListTerms(const std::vector<Port::StringBase<char>>& terms,
                                    bool reverseTerms);

#endif
