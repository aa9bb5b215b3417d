// Why two tables that should be one differ, where a fault that tools make explains it: what was
// done to the one so that it became the other. In: the pins of both tables in common net numbers.
// Out: every fault that explains the difference whole, each applied and compared before it is
// named.  Cost: some thousand operations on rows.
#ifndef BOOLEQ_INSPECT_CAUSE_H
#define BOOLEQ_INSPECT_CAUSE_H

#include <string>
#include <vector>

#include "net_function.h"

namespace booleq {

enum class CauseCode {
    OutputInverted,
    PinsSwapped,     // inputs trade places; the init value did not follow
    BitOrder,        // the pins' significance is reversed
    HalvesExchanged, // of the init value: its most significant pin is inverted
    InputInverted,   // another pin is
    DigitsShifted,
    DigitsRotated,
    DigitsLost, // the first ones are 0
    DigitsReversed,
    DigitChanged, // one
    OtherNet,     // one input comes from another net
    InputStuck,   // one input is taken as a constant
    OutputMoved   // the function is the same, and drives another net
};

struct Cause {
    CauseCode code;
    std::vector<NetId> nets; // of PinsSwapped the nets of the left table, then what each is taken
                             // for; of the others the nets that they are about
    std::string detail; // more than the nets say: "by 2 digits to the right, filled with zeros"
};

// "pins-swapped" and so on, for reports.
const char* CauseWord(CauseCode code);

// Causes in the order of CauseCode's list. Both tables are given as pins, the first one the most
// significant.
// Requires: the functions differ.
std::vector<Cause> FindCauses(const PinFunction& left, const PinFunction& right);

// What the right table's init value would have to be for the left one's function: rows over the
// right one's pins.
// Fails: false where the right one lacks a net that the left one depends on.
bool RightRows(const NetFunction& left, const PinFunction& right, Rows& rows);

} // namespace booleq

#endif
