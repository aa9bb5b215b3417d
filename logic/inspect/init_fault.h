// What programs do to init values by mistake: digits shifted, halves exchanged and so on.
// Cost: in step with the rows times the digits; wide tables have no faults of single digits.
#ifndef BOOLEQ_INSPECT_INIT_FAULT_H
#define BOOLEQ_INSPECT_INIT_FAULT_H

#include <functional>
#include <string>
#include <vector>

#include "cause.h"
#include "rows.h"

namespace booleq {

constexpr unsigned int kDigitRows = 4; // of a hexadecimal digit

// What may happen to an init value, and what undoes it.
struct InitFault {
    CauseCode code;
    std::string detail;
    std::function<Rows(const Rows&)> apply;
    std::function<Rows(const Rows&)> undo; // empty where something is lost
    int input = -1;                        // of the pins, that it is about
};

// Those that happen to the init value alone, of so many pins.
std::vector<InitFault> InitFaults(unsigned int numInputs);

} // namespace booleq

#endif
