// The inputs of two expressions as one list.
#ifndef BOOLEQ_DECIDE_JOINED_INPUTS_H
#define BOOLEQ_DECIDE_JOINED_INPUTS_H

#include <cstdint>
#include <string>
#include <vector>

namespace booleq {

// Appends to 'inputs' the names of 'right' that it lacks, and returns the place of each in it.
// Requires: in each list all names are different.
std::vector<uint32_t> JoinInputs(const std::vector<std::string>& right,
                                 std::vector<std::string>& inputs);

} // namespace booleq

#endif
