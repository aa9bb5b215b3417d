// What is odd about a design's tables: what the reader found, then what the tables themselves show.
// One finding is one object; there may be as many as tables.
// Cost: a look at each table; memory for one number for each where equal ones are looked for.
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

// What kinds of findings there are: a stable word, how bad it is, and a sentence.
struct FindingRule {
    std::string word; // "init-short"
    Severity severity;
    std::string sentence;
};
// Those of the reader first, by FindingCode, then those of tables.
const std::vector<FindingRule>& FindingRules();

struct TableFinding {
    size_t rule;      // of FindingRules
    uint32_t line;    // in the file; 0: not known
    std::string path; // of the table (TableName), cell or net
    std::string text; // a sentence without a full stop
};

// Takes a finding; false ends the search.
typedef std::function<bool(const TableFinding&)> FindingTaker;

// Calls 'take' for each finding: the reader's, then the others in the order of tables.
// Gives back how many it was called for.
uint64_t FindFindings(const Design& design, const FindingTaker& take);

} // namespace booleq

#endif
