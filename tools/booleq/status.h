// Exit statuses of the tool; scripts rely on these numbers.
#ifndef BOOLEQ_STATUS_H
#define BOOLEQ_STATUS_H

namespace booleq {

constexpr int kDone = 0;
constexpr int kWrongUsage = 2;
constexpr int kRefused = 3;    // at least one equation was refused; the others were answered
constexpr int kUnfinished = 4; // reading or writing failed, or memory ran out

} // namespace booleq

#endif
