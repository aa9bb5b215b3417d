// Checks what must be true of every design that a reader gives, and writes designs as lines of
// text.
#ifndef TESTS_DESIGN_DESIGN_CHECK_H
#define TESTS_DESIGN_DESIGN_CHECK_H

#include <string>
#include <vector>

#include "read_design.h"

namespace tests {

// "" or the first invariant that does not hold. Folds every table and names every net.
std::string BrokenInvariant(const booleq::Design& design);

// A table in one line, "path type.pin: net = hex(net, ...)", with the last pin first, as in rows.
std::string TableLine(const booleq::Design& design, const booleq::DesignTable& table);
std::vector<std::string> TableLines(const booleq::Design& design);
// "code name text" of each finding.
std::vector<std::string> FindingLines(const booleq::Design& design);

// The net that has this name, shown or not; kNetOpen if there is none.
booleq::NetId NetOf(const booleq::Design& design, const std::string& name);

// The tables as functions of nets, sorted, one in each line: "y = hex(a, b)". The lines do not
// depend on names of cells or on the order of pins; nets have the names that 'reference' shows for
// them. Inputs without effect are left out, and so are tables that are wires.
std::vector<std::string> FunctionLines(const booleq::Design& design,
                                       const booleq::Design& reference);

} // namespace tests

#endif
