// Functions over another order of their inputs.
#ifndef BOOLEQ_ANSWERS_PERMUTE_H
#define BOOLEQ_ANSWERS_PERMUTE_H

#include <cstddef>
#include <string>
#include <vector>

namespace booleq {

constexpr size_t kMaxPermuteInputs = 24; // 16 million binary digits

// Why 'names' is not an order of inputs: an entry is not a name, or is listed twice; empty if it is
// one.
std::string OrderFault(const std::vector<std::string>& names);
// The first of 'inputs' that 'order' does not list; empty if it lists all.
std::string FirstUnlisted(const std::vector<std::string>& inputs,
                          const std::vector<std::string>& order);

} // namespace booleq

#endif
