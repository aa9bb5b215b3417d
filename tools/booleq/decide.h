// What the commands that decide share: their options, what is shown during the work, and files of
// clauses and proofs.
#ifndef BOOLEQ_DECIDE_H
#define BOOLEQ_DECIDE_H

#include <kq_logic/decide.h>

#include "answer.h"
#include "cnf.h"
#include "deadline.h"
#include "progress.h"

namespace booleq {

// "--seconds": for commands whose decision must not take forever.
Option SecondsOption();
// "--cnf" and "--proof".
std::vector<Option> ClauseOptions();

// The value of --seconds; 'seconds' without it.  Fails: UsageError.
double ParseSeconds(const Request& request, double seconds);

// While it exists, shows on a terminal how long something has been decided or searched for.
// One at a time.
class WorkingProgress {
  public:
    WorkingProgress();
    ~WorkingProgress();
    WorkingProgress(const WorkingProgress&) = delete;
    WorkingProgress& operator=(const WorkingProgress&) = delete;
};
// Returns the result of 'work', and shows this meanwhile.
template <class Work>
auto Watched(const Work& work)
{
    const WorkingProgress progress;
    return work();
}

// Fails: UsageError, when a file is asked for that cannot be written: for many lines, or a proof in
// a build without a solver. To be called first.
void CheckClauseOptions(const Request& request);
// Writes the files that are asked for. 'verdict' is the decision about the question; only
// kq_logic::Verdict::Equal, meaning that nothing satisfies the clauses, can be proved. Returns a
// status: kDone, or kUndecided when the proof was not finished in time, and then there is no file.
// Fails: IoError.
int WriteClauses(const Request& request, Output& output, const Cnf& cnf, kq_logic::Verdict verdict,
                 double seconds);
// Whether any file is asked for.
bool WantsClauses(const Request& request);

inline bool IsEqual(const kq_logic::Decision& decision)
{
    return decision.verdict == kq_logic::Verdict::Equal;
}
inline bool IsDifferent(const kq_logic::Decision& decision)
{
    return decision.verdict == kq_logic::Verdict::Different;
}
// The assignment that makes a difference, as a row number.  Requires: Different, at most 64 inputs.
uint64_t RowOf(const kq_logic::Decision& decision);

// "not decided in 10 seconds"
std::string NotDecidedIn(double seconds);
// The same, or "not decided: " and the reason.
// Requires: the decision is undecided, and this many seconds were allowed.
std::string UndecidedText(const kq_logic::Decision& decision, double seconds);
// Name and value of each input.
Json AssignmentJson(const std::vector<std::string>& inputs, const std::vector<bool>& values);
// "first at row 4 of 8", or whatever else is known about it.
std::string PlaceText(const kq_logic::Decision& decision);
// The row number; null when there are too many inputs for one.
Json RowJson(const kq_logic::Decision& decision);

} // namespace booleq

#endif
