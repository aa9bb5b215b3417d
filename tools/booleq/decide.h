// What commands that decide share: their options, what is shown meanwhile, and files of clauses and
// of proofs.
#ifndef BOOLEQ_DECIDE_H
#define BOOLEQ_DECIDE_H

#include <kq_logic/decide.h>

#include "answer.h"
#include "cnf.h"
#include "deadline.h"
#include "progress.h"

namespace booleq {

// "--seconds": where a decision must not take forever.
Option SecondsOption();
// "--cnf" and "--proof".
std::vector<Option> ClauseOptions();

// What --seconds says; 'seconds' without it.  Fails: UsageError.
double ParseSeconds(const Request& request, double seconds);

// Says on a terminal for how long something is being decided or searched for, as long as it lives.
// One at a time.
class WorkingProgress {
  public:
    WorkingProgress();
    ~WorkingProgress();
    WorkingProgress(const WorkingProgress&) = delete;
    WorkingProgress& operator=(const WorkingProgress&) = delete;
};
// What 'work' gives back, with that meanwhile.
template <class Work>
auto Watched(const Work& work)
{
    const WorkingProgress progress;
    return work();
}

// Fails: UsageError, when a file is asked for that cannot be: of many lines, or a proof from a
// build without a solver. To be called first.
void CheckClauseOptions(const Request& request);
// Writes the files that are asked for. 'verdict' is what was decided about the question; only
// kq_logic::Verdict::Equal, nothing satisfies the clauses, can be proved. Gives back a status:
// kDone, or kUndecided when the proof was not finished in time, and there is no file then. Fails:
// IoError.
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
// The assignment that differs, as a row number.  Requires: Different, at most 64 inputs.
uint64_t RowOf(const kq_logic::Decision& decision);

// "not decided in 10 seconds"
std::string NotDecidedIn(double seconds);
// The same, or "not decided: " and the reason.
// Requires: the decision is undecided, and so many seconds were allowed.
std::string UndecidedText(const kq_logic::Decision& decision, double seconds);
// Name and value of each input.
Json AssignmentJson(const std::vector<std::string>& inputs, const std::vector<bool>& values);
// "first at row 4 of 8", or what else is known of it.
std::string PlaceText(const kq_logic::Decision& decision);
// The row number, null for more inputs than a row number is given for.
Json RowJson(const kq_logic::Decision& decision);

} // namespace booleq

#endif
