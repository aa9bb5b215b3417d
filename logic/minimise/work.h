// The work that a search has spent, in words of cubes looked at. Spend throws if that is too much,
// if time is up, or if the watcher throws. The unit is the same on every machine, so limits in it
// keep results repeatable.
#ifndef BOOLEQ_MINIMISE_WORK_H
#define BOOLEQ_MINIMISE_WORK_H

#include <chrono>
#include <cstdint>

namespace booleq {

// Thrown by Work::Spend; searches catch it if they have a result to fall back on.
struct OutOfWork {
    bool isTime; // otherwise the limit of units
};

class Work {
  public:
    typedef std::chrono::steady_clock Clock;

    // Throws OutOfWork, and what the watcher throws.
    void Spend(uint64_t units)
    {
        m_spent += units;
        if (m_spent >= m_next_check)
            Check();
    }
    uint64_t Spent() const { return m_spent; }
    // Spend throws from 'spent' units on; UINT64_MAX: never.
    void SetLimit(uint64_t spent);
    uint64_t Limit() const { return m_limit; }
    void SetDeadline(Clock::time_point deadline) { m_deadline = deadline; }
    Clock::time_point Deadline() const { return m_deadline; }

  private:
    static constexpr uint64_t kUnitsBetweenChecks = 1u << 20; // about a millisecond

    void Check();

    uint64_t m_spent = 0;
    uint64_t m_next_check = kUnitsBetweenChecks;
    uint64_t m_limit = UINT64_MAX;
    Clock::time_point m_deadline = Clock::time_point::max();
};

} // namespace booleq

#endif
