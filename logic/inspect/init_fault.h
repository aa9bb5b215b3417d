// Mistakes that programs make with init values: digits shifted, halves exchanged and so on.
// Cost: rows times digits; wide tables have no faults of single digits.
#ifndef BOOLEQ_INSPECT_INIT_FAULT_H
#define BOOLEQ_INSPECT_INIT_FAULT_H

#include <functional>
#include <string>
#include <vector>

#include "cause.h"
#include "rows.h"

namespace booleq {

constexpr unsigned int kDigitRows = 4; // rows in a hexadecimal digit

// A fault of an init value, and how to undo it.
struct InitFault {
    CauseCode code;
    std::string detail;
    std::function<Rows(const Rows&)> apply;
    std::function<Rows(const Rows&)> undo; // empty if the fault loses something
    int input = -1;                        // the pin that the fault is about; -1: none
};

// The faults that change only the init value of a table of so many pins.
std::vector<InitFault> InitFaults(unsigned int numInputs);

} // namespace booleq

#endif
