// What the targets of the netlist formats share.
#ifndef FUZZ_NETLIST_H
#define FUZZ_NETLIST_H

#include "fuzz/target.h"
#include "tests/design/design_check.h"

namespace fuzz {

inline std::string DescribeNetlist(const std::string& input, const std::string& format)
{
    return format + " of " + std::to_string(input.size()) + " bytes:\n" + input + "\n";
}

// A text in another format is not this target's; Verilog would go to another program.
inline std::string CheckNetlist(const std::string& input, const std::string& format)
{
    const char first = format == "BLIF" ? '.' : format == "EDIF" ? '(' : '{';
    if (input.empty() || input[0] != first || input.compare(0, 2, "(*") == 0)
        return "";
    booleq::ReadOptions options;
    options.maxItems = 10000;
    options.keyAttribute = "BEL";
    booleq::Design design;
    std::string fault;
    if (ReadDesignText(input, "input", options, design, fault))
        return tests::BrokenInvariant(design);
    if (!design.tables.empty() || design.names.Size() != 1)
        return "refused, with a result";
    return fault.size() > 7 ? "" : "refused without a reason";
}

} // namespace fuzz

#endif
