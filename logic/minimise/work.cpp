// The limits of searches.
#include "work.h"

#include <algorithm>

#include "watch.h"

namespace booleq {

void Work::SetLimit(uint64_t spent)
{
    m_limit = spent;
    m_next_check = std::min(m_spent + kUnitsBetweenChecks, m_limit);
}

void Work::Check()
{
    Watch();
    m_next_check = std::min(m_spent + kUnitsBetweenChecks, std::max(m_limit, m_spent + 1));
    if (m_spent >= m_limit)
        throw OutOfWork{false};
    if (m_deadline != Clock::time_point::max() && Clock::now() >= m_deadline)
        throw OutOfWork{true};
}

} // namespace booleq
