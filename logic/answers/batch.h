// One row of a table of functions: inputs, equation and init value, what is missing filled in and
// what is given compared.
#ifndef BOOLEQ_ANSWERS_BATCH_H
#define BOOLEQ_ANSWERS_BATCH_H

#include <string>
#include <vector>

#include <port/Port_StringBase.h>

#include "listed_inputs.h"
#include "recent.h"

namespace booleq {

enum class BatchOutcome {
    kOk,         // all were given and agree
    kFilled,     // something was missing and is there now
    kDiffers,    // what was given does not agree
    kIncomplete, // too little was given, or there is no init value
    kTextRefused // a text was refused
};

// "ok", "filled", "differs", "incomplete", "refused".
const char* OutcomeName(BatchOutcome outcome);

// An empty member is missing.
struct BatchRow {
    std::vector<std::string> inputs; // the first is the most significant
    std::string equation;
    std::string init;
};

struct BatchResult {
    BatchOutcome outcome = BatchOutcome::kOk;
    std::string message; // for kDiffers, kIncomplete and kTextRefused; one sentence
};

// Completes rows one after the other. It remembers the lists of inputs that it met lately, as most
// rows of a table share a few.
// Threads: any, each with rows and a completer of its own.
class RowCompleter {
  public:
    // Fills and compares. Where the outcome is neither kOk nor kFilled, the row is as it was.
    // An equation without init value gets the hexadecimal one, the binary one over one input,
    // because that reads back; without inputs it has none. Missing inputs are those of the equation
    // in order of first occurrence. A missing equation is a short one up to six inputs; above it is
    // the one the library reads the init value as.
    // Cost: that of the column, up to 30 inputs.
    BatchResult Complete(BatchRow& row);

    // Inputs as the library takes them.
    struct Listed {
        Reading reading;
        std::vector<Port::StringBase<char>> terms;
        BatchResult fault;     // of these inputs; kOk for none
        std::string splitName; // one over which no init value reads back; empty for none
    };

  private:
    Recent<std::vector<std::string>, Listed> m_listed;
};

} // namespace booleq

#endif
