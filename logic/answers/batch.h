// One row of a table of functions: inputs, equation and init value. What is missing is filled in,
// and what is given is compared.
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
    kFilled,     // something was missing and has been filled in
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

// Completes rows one after another. It remembers recent lists of inputs, because most rows of a
// table share a few.
// Threads: any, each with its own rows and its own completer.
class RowCompleter {
  public:
    // Fills in and compares. Unless the outcome is kOk or kFilled, the row stays as it was.
    // An equation without an init value gets the hexadecimal one; over one input it gets the binary
    // one, because that reads back; without inputs it gets none. Missing inputs are those of the
    // equation in order of first occurrence. A missing equation is a short one up to six inputs;
    // above that, it is the expression that the library reads the init value as.
    // Cost: that of the column, up to 30 inputs.
    BatchResult Complete(BatchRow& row);

    // Inputs in the form that the library takes.
    struct Listed {
        Reading reading;
        std::vector<Port::StringBase<char>> terms;
        BatchResult fault;     // of these inputs; kOk if there is none
        std::string splitName; // one over which no init value reads back; empty if none
    };

  private:
    Recent<std::vector<std::string>, Listed> m_listed;
};

} // namespace booleq

#endif
