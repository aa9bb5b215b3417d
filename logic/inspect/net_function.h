// A look-up table as what it says about nets: its rows over the nets that matter, in one order, so
// that two tables say the same where these are equal, whatever their pins, widths and types.
// Cost: a few operations on the rows for each input; up to six inputs in one word.
#ifndef BOOLEQ_INSPECT_NET_FUNCTION_H
#define BOOLEQ_INSPECT_NET_FUNCTION_H

#include <string>
#include <vector>

#include "design.h"
#include "rows.h"

namespace booleq {

// Rows over pins, the first one the most significant bit of a row's number, as they are: nets may
// be constants, repeat, or have no effect.
struct PinFunction {
    Rows rows;
    std::vector<NetId> nets;
};

// Invariants of what Normalise makes:
// 1. Each net stands once, ascending, and none is kNetZero or kNetOne.
// 2. The rows depend on every net.
// An open or unknown pin is an input like another; several of them are one.
struct NetFunction {
    Rows rows;
    std::vector<NetId> nets;
};

bool operator==(const NetFunction& left, const NetFunction& right);
inline bool operator!=(const NetFunction& left, const NetFunction& right)
{
    return !(left == right);
}

// Requires: as many nets as the rows have inputs.
NetFunction Normalise(PinFunction pins);
// The same with the nets called by other numbers.
NetFunction Renumber(const NetFunction& function, const std::vector<NetId>& numbers);

// With a net at a value, and with another net in place of it; a net without effect changes nothing.
NetFunction Fix(const NetFunction& function, NetId net, bool value);
NetFunction Replace(const NetFunction& function, NetId net, NetId by);

// Hexadecimal digits of rows, the highest first, as Function::Hex writes them.
std::string HexOf(const Rows& rows);

// The pins of a table.
PinFunction PinsOf(const Design& design, const DesignTable& table);

// Where the two first differ: a value for each of 'order', its first one counting most.
// Requires: they differ, and 'order' has all nets of both.
std::vector<bool> FirstDifference(const NetFunction& left, const NetFunction& right,
                                  const std::vector<NetId>& order);
// The value for an assignment of the nets in 'order'.  Requires: it has all nets of the function.
bool ValueAt(const NetFunction& function, const std::vector<NetId>& order,
             const std::vector<bool>& values);

} // namespace booleq

#endif
