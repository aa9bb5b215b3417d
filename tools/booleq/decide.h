// What commands that decide share: their options, what is shown meanwhile, and files of clauses and
// of proofs.
#ifndef BOOLEQ_DECIDE_H
#define BOOLEQ_DECIDE_H

#include "answer.h"
#include "cnf.h"
#include "decision.h"
#include "progress.h"

namespace booleq {

// "--seconds": where a decision must not take forever.
Option SecondsOption();
// "--cnf" and "--proof".
std::vector<Option> ClauseOptions();

// What --seconds says; 'seconds' without it.  Fails: UsageError.
Limits ParseLimits(const Request& request, double seconds);

// Says on a terminal for how long something is being decided, as long as it lives. One at a time.
class DecidingProgress {
  public:
    DecidingProgress();
    ~DecidingProgress();
    DecidingProgress(const DecidingProgress&) = delete;
    DecidingProgress& operator=(const DecidingProgress&) = delete;
};

// Fails: UsageError, when a file is asked for that cannot be: of many lines, or a proof from a
// build without a solver. To be called first.
void CheckClauseOptions(const Request& request);
// Writes the files that are asked for. 'verdict' is what was decided about the question; only
// Verdict::Equal, nothing satisfies the clauses, can be proved. Gives back a status: kDone, or
// kUndecided when the proof was not finished in time, and there is no file then.
// Fails: IoError.
int WriteClauses(const Request& request, Output& output, const Cnf& cnf, Verdict verdict,
                 const Limits& limits);
// Whether any file is asked for.
bool WantsClauses(const Request& request);

// "a=1 b=0"; "no inputs" without any.
std::string AssignmentLine(const Decision& decision);
// Name and value of each input.
Json AssignmentJson(const Decision& decision);
// "first at row 4 of 8", or what else is known of it.
std::string PlaceText(const Decision& decision);
// The row number, null for more inputs than a row number is given for.
Json RowJson(const Decision& decision);

} // namespace booleq

#endif
