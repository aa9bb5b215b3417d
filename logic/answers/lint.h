// What can go wrong with a text: which notations read it as another function, and where this
// library does something that its writer may not expect.
#ifndef BOOLEQ_ANSWERS_LINT_H
#define BOOLEQ_ANSWERS_LINT_H

#include <string>
#include <utility>
#include <vector>

#include <Kq_BoolEquation.h>

#include "decision.h"
#include "expression.h"
#include "listed_inputs.h"
#include "notation.h"

namespace booleq {

// How another notation reads the text.
struct ForeignReading {
    const char* notation = nullptr;
    bool isRead = false;
    std::string fault; // why it is not read
    Decision decision; // about this library's function (left) and this one
    // Unless they are equal:
    std::string grouping;  // with parentheses around every operation
    std::string reason;    // what differs there
    std::string textThere; // writes there what the text means here
    std::string textHere;  // writes here what the text means there; may be empty
    std::string hex;       // the function read, even if equal, up to kMaxLintHexInputs inputs
};

struct Finding {
    const char* code; // a stable word
    std::string message;
    std::vector<std::pair<std::string, std::string>> details; // a label and its text
};

struct LintReport {
    std::string grouping; // this library's, with parentheses around every operation
    std::vector<std::string> inputs;
    std::vector<ForeignReading> readings; // none for an init value
    std::vector<Finding> findings;        // apart from the readings

    bool IsClean() const;
};

constexpr size_t kMaxLintHexInputs = 10;

// 'equation' was set from 'text' as 'reading' says. The limits apply to each comparison.
LintReport Lint(const std::string& text, const Kq_BoolEquation& equation, const Reading& reading,
                const Limits& limits);

// "A=1 B=0"; with many inputs only those that are 1 are named.
std::string AssignmentText(const std::vector<std::string>& names, const std::vector<bool>& values);

} // namespace booleq

#endif
