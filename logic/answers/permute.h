// Functions over another order of their inputs.
#ifndef BOOLEQ_ANSWERS_PERMUTE_H
#define BOOLEQ_ANSWERS_PERMUTE_H

#include <cstddef>
#include <string>
#include <vector>

namespace booleq {

constexpr size_t kMaxPermuteInputs = 24; // 16 million binary digits

// What keeps 'names' from being an order of inputs: one that is not a name, or is listed twice;
// empty when nothing does.
std::string OrderFault(const std::vector<std::string>& names);
// The first of 'inputs' that 'order' does not list; empty when it lists all.
std::string FirstUnlisted(const std::vector<std::string>& inputs,
                          const std::vector<std::string>& order);

} // namespace booleq

#endif
