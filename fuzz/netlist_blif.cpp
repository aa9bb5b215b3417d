// The input is a netlist in the BLIF format: it is read or refused with a reason, and every
// invariant holds.
#include "fuzz/netlist.h"

namespace fuzz {

std::string Describe(const std::string& input)
{
    return DescribeNetlist(input, "BLIF");
}

std::string Check(const std::string& input)
{
    return CheckNetlist(input, "BLIF");
}

} // namespace fuzz
