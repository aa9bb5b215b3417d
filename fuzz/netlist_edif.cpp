// The input is a netlist in the EDIF format: it is read or refused with a reason, and every
// invariant holds.
#include "fuzz/netlist.h"

namespace fuzz {

std::string Describe(const std::string& input)
{
    return DescribeNetlist(input, "EDIF");
}

std::string Check(const std::string& input)
{
    return CheckNetlist(input, "EDIF");
}

} // namespace fuzz
