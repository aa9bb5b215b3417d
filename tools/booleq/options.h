// Command line in, what to do out; the help texts.
#ifndef BOOLEQ_OPTIONS_H
#define BOOLEQ_OPTIONS_H

#include <cstdint>
#include <string>
#include <vector>

#include "command.h"

namespace booleq {

// The words of a command line, understood: either an answer that is ready, or a request.
struct CommandLine {
    std::string answer; // not empty: the text of --help or --version, and nothing else to do
    Request request;
};

// Fails: UsageError.
CommandLine ParseCommandLine(const std::vector<std::string>& arguments);

// A number of --rows: "all" is the highest.  Fails: UsageError.
uint64_t ParseRows(const std::string& text);
// A number of --seconds, of which parts count; 0, no bound, where the option was not given.
// Fails: UsageError.
double ParseSeconds(const Request& request);

} // namespace booleq

#endif
