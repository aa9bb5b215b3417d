// Command line in, what to do out.
#ifndef BOOLEQ_OPTIONS_H
#define BOOLEQ_OPTIONS_H

#include <cstdint>
#include <stdexcept>
#include <string>
#include <vector>

#include "reading.h"

namespace booleq {

// The command line makes no sense; the text says why and what to write.
class UsageError : public std::runtime_error {
  public:
    using std::runtime_error::runtime_error;
};

struct Options {
    std::string answer;   // not empty: the text of --help or --version, and nothing else to do
    std::string equation; // "-": the lines of standard input
    Reading reading;
    uint64_t maxRows = 64;  // truth-table rows to print
    bool wholeInit = false; // init values of any length
    bool debug = false;     // the library's diagnostics are let through
};

// Fails: UsageError.
Options ParseOptions(const std::vector<std::string>& arguments);

} // namespace booleq

#endif
