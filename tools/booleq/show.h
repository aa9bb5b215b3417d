// The command 'show': everything the library answers about one equation, as aligned text.
#ifndef BOOLEQ_SHOW_H
#define BOOLEQ_SHOW_H

#include "options.h"
#include "output.h"

namespace booleq {

// Shows 'text'. 'lineNumber' heads the answer and every complaint, and an empty line ends the
// answer; 0 stands for the command line's own equation, which needs neither.
// Fails: false for a refused text, after a complaint; IoError.
bool ShowText(const std::string& text, size_t lineNumber, const Options& options, Output& output);

} // namespace booleq

#endif
