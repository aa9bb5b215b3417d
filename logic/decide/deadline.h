// How long a decision may take: a deadline, and the watcher of the embedding program.
#ifndef BOOLEQ_DECIDE_DEADLINE_H
#define BOOLEQ_DECIDE_DEADLINE_H

#include <algorithm>
#include <chrono>

#include "watch.h"

namespace booleq {

struct Limits {
    double seconds = 0; // 0: no limit
};

class Deadline {
  public:
    // The time starts here.
    explicit Deadline(const Limits& limits) : m_limits(limits), m_start(Clock::now()) {}

    // Calls the watcher, which may throw. Cost: a look at the clock.
    bool IsOver() const
    {
        Watch();
        return m_limits.seconds > 0 &&
               std::chrono::duration<double>(Clock::now() - m_start).count() >= m_limits.seconds;
    }

    // The seconds that are left; if none are, a tiny positive number.  Requires: there is a limit.
    double Left() const
    {
        const std::chrono::duration<double> passed = Clock::now() - m_start;
        return std::max(m_limits.seconds - passed.count(), 1e-9);
    }

  private:
    typedef std::chrono::steady_clock Clock;
    Limits m_limits;
    Clock::time_point m_start;
};

} // namespace booleq

#endif
