// Command line in, what to do out; the help texts.
#ifndef BOOLEQ_OPTIONS_H
#define BOOLEQ_OPTIONS_H

#include <cstdint>
#include <string>
#include <vector>

#include "command.h"

namespace booleq {

// The words of a command line after parsing: either a ready answer or a request.
struct CommandLine {
    std::string answer; // not empty: the text of --help or --version, and nothing else to do
    std::string note;   // not empty: print this on standard error first
    Request request;
};

// Fails: UsageError.
CommandLine ParseCommandLine(const std::vector<std::string>& arguments);

// The value of --rows: "all" is the highest number.  Fails: UsageError.
uint64_t ParseRows(const std::string& text);

} // namespace booleq

#endif
