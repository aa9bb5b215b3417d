// What is odd about a design's tables: what the reader found, then what the tables themselves show.
// Findings are passed on one by one; there may be as many as tables.
// Cost: one visit to each table; memory for one number for each distinct function of nets.
#ifndef BOOLEQ_INSPECT_TABLE_FINDINGS_H
#define BOOLEQ_INSPECT_TABLE_FINDINGS_H

#include <functional>
#include <string>
#include <vector>

#include "design.h"

namespace booleq {

enum class Severity { Error, Warning, Note };
// "error", "warning" or "note".
const char* SeverityWord(Severity severity);

// A kind of finding: a stable word, how bad it is, and a sentence.
struct FindingRule {
    std::string word; // "init-short"
    Severity severity;
    std::string sentence;
};
// All kinds: the reader's first, by FindingCode, then those of tables.
const std::vector<FindingRule>& FindingRules();

struct TableFinding {
    size_t rule;      // of FindingRules
    uint32_t line;    // of the file; 0: not known
    std::string path; // of the table (as from TableName), cell or net
    std::string text; // a sentence without a full stop
};

// Takes a finding; returning false ends the search.
typedef std::function<bool(const TableFinding&)> FindingTaker;

// Calls 'take' for each finding: the reader's, then the others in the order of tables. Returns the
// number of calls.
uint64_t FindFindings(const Design& design, const FindingTaker& take);

} // namespace booleq

#endif
