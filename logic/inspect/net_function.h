// A look-up table as a function of nets: its rows over the nets that matter, in ascending order.
// Two tables are the same function if these are equal, whatever their pins, widths and types.
// Cost: a few operations on the rows for each input; up to six inputs fit in one word.
#ifndef BOOLEQ_INSPECT_NET_FUNCTION_H
#define BOOLEQ_INSPECT_NET_FUNCTION_H

#include <string>
#include <vector>

#include "design.h"
#include "rows.h"

namespace booleq {

// Rows over pins as given, the first pin being the most significant bit of a row's number. Nets may
// be constants, repeat, or have no effect.
struct PinFunction {
    Rows rows;
    std::vector<NetId> nets;
};

// Invariants of what Normalise makes:
// 1. Nets are ascending, each occurs once, and none is kNetZero or kNetOne.
// 2. The rows depend on every net.
// Open pins count as one input like any other, and so do unknown pins.
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
// The same function with net k renumbered to numbers[k].
NetFunction Renumber(const NetFunction& function, const std::vector<NetId>& numbers);

// The function with a net fixed to a value, or replaced by another net. A net that is not in the
// function changes nothing.
NetFunction Fix(const NetFunction& function, NetId net, bool value);
NetFunction Replace(const NetFunction& function, NetId net, NetId by);

// The hexadecimal digits of rows, the highest first, as Function::Hex writes them.
std::string HexOf(const Rows& rows);

// The pins of a table.
PinFunction PinsOf(const Design& design, const DesignTable& table);

// The first assignment for which the two differ: a value for each net of 'order', the first
// counting most.
// Requires: they differ, and 'order' has all nets of both.
std::vector<bool> FirstDifference(const NetFunction& left, const NetFunction& right,
                                  const std::vector<NetId>& order);
// The value for an assignment of the nets in 'order'.  Requires: 'order' has all nets of the
// function.
bool ValueAt(const NetFunction& function, const std::vector<NetId>& order,
             const std::vector<bool>& values);

} // namespace booleq

#endif
