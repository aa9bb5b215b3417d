// Why two tables that should be the same differ, if a typical fault of tools explains it: what
// turned one into the other. In: the pins of both tables in common net numbers. Out: every fault
// that explains the whole difference; each is applied and the result compared before it is named.
// Cost: some thousand operations on rows.
#ifndef BOOLEQ_INSPECT_CAUSE_H
#define BOOLEQ_INSPECT_CAUSE_H

#include <string>
#include <vector>

#include "net_function.h"

namespace booleq {

enum class CauseCode {
    OutputInverted,
    PinsSwapped,     // inputs are exchanged; the init value did not follow
    BitOrder,        // the pins' significance is reversed
    HalvesExchanged, // of the init value: the most significant pin is inverted
    InputInverted,   // any other pin is inverted
    DigitsShifted,
    DigitsRotated,
    DigitsLost, // the first ones are 0
    DigitsReversed,
    DigitChanged, // one
    OtherNet,     // one input comes from another net
    InputStuck,   // one input is replaced by a constant
    OutputMoved   // the function is the same but drives another net
};

struct Cause {
    CauseCode code;
    std::vector<NetId> nets; // for PinsSwapped, nets of the left table, then what each became; else
                             // the nets concerned
    std::string detail; // in addition to the nets: "by 2 digits to the right, filled with zeros"
};

// A word for reports, such as "pins-swapped".
const char* CauseWord(CauseCode code);

// The causes, in the order of CauseCode. Both tables are given by their pins, the most significant
// first.
// Requires: the functions differ.
std::vector<Cause> FindCauses(const PinFunction& left, const PinFunction& right);

// The init value that would give the right table the left one's function, as rows over the right
// one's pins.
// Fails: false if the right one lacks a net on which the left one depends.
bool RightRows(const NetFunction& left, const PinFunction& right, Rows& rows);

} // namespace booleq

#endif
