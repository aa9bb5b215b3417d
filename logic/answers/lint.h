// What can go wrong with a text: who reads it as another function, and where this library does what
// its writer may not expect.
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
    std::string fault; // why it is not
    Decision decision; // with this library's function, the left one
    // Unless they are equal:
    std::string grouping;  // with parentheses around every operation
    std::string reason;    // what is different there
    std::string textThere; // says there what the text says here
    std::string textHere;  // says here what the text says there; may be empty
    std::string hex;       // the function read, up to kMaxShownInputs inputs
};

struct Finding {
    const char* code; // a stable word
    std::string message;
    std::vector<std::pair<std::string, std::string>> details; // a label and what it is
};

struct LintReport {
    std::string grouping; // this library's, with parentheses around every operation
    std::vector<std::string> inputs;
    std::vector<ForeignReading> readings; // none for an init value
    std::vector<Finding> findings;        // beside those

    bool IsClean() const;
};

constexpr size_t kMaxLintHexInputs = 10;

// 'equation' was set from 'text' as 'reading' says. The limits are those of each comparison.
LintReport Lint(const std::string& text, const Kq_BoolEquation& equation, const Reading& reading,
                const Limits& limits);

// "A=1 B=0"; for many inputs only those that are 1 are named.
std::string AssignmentText(const std::vector<std::string>& names, const std::vector<bool>& values);

} // namespace booleq

#endif
