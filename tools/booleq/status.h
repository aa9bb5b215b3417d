// Exit statuses of the tool; scripts rely on these numbers. When lines are answered one by one, the
// tool returns the highest status of any line.
#ifndef BOOLEQ_STATUS_H
#define BOOLEQ_STATUS_H

namespace booleq {

constexpr int kDone = 0;       // done, or the answer is yes
constexpr int kFindings = 1;   // the answer is no, or there are findings
constexpr int kWrongUsage = 2; // wrong usage; reading or writing failed, or memory ran out
constexpr int kRefused = 3;    // a text was refused; the others were answered
constexpr int kUndecided = 4;  // a limit ended a decision, so there is no yes or no

} // namespace booleq

#endif
