// The inputs of two expressions as one list.
#ifndef BOOLEQ_DECIDE_JOINED_INPUTS_H
#define BOOLEQ_DECIDE_JOINED_INPUTS_H

#include <cstdint>
#include <string>
#include <vector>

namespace booleq {

// Appends to 'inputs' the names of 'right' that it lacks, and returns the place in it of each name
// of 'right'.
// Requires: all names in a list are different.
std::vector<uint32_t> JoinInputs(const std::vector<std::string>& right,
                                 std::vector<std::string>& inputs);

} // namespace booleq

#endif
