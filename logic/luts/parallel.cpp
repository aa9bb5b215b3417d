#include "parallel.h"

#include <algorithm>
#include <atomic>
#include <cassert>
#include <exception>
#include <mutex>
#include <thread>
#include <vector>

#include "watch.h"

namespace booleq {

namespace {

// Hands out parts in order to the threads that ask for the next one.
class Parts {
  public:
    Parts(size_t count, size_t partSize, const PartRunner& run)
        : m_count(count), m_part_size(partSize), m_run(run)
    {
    }

    // Runs parts until none is left or a thread has failed.  'before' is called before each part.
    template <class Before>
    void Run(const Before& before)
    {
        try {
            for (;;) {
                const size_t begin = m_next.fetch_add(m_part_size, std::memory_order_relaxed);
                if (begin >= m_count || m_has_failed.load(std::memory_order_relaxed))
                    return;
                before();
                m_run(begin, std::min(begin + m_part_size, m_count));
            }
        } catch (...) {
            const std::lock_guard<std::mutex> lock(m_mutex);
            if (!m_failure)
                m_failure = std::current_exception();
            m_has_failed = true;
        }
    }

    // Requires: all threads have ended.
    void ThrowFailure() const
    {
        if (m_failure)
            std::rethrow_exception(m_failure);
    }

  private:
    const size_t m_count;
    const size_t m_part_size;
    const PartRunner& m_run;
    std::atomic<size_t> m_next{0}; // passes the count by at most partSize for each thread
    std::atomic<bool> m_has_failed{false};
    std::mutex m_mutex; // guards m_failure
    std::exception_ptr m_failure;
};

} // namespace

void RunInParts(size_t count, size_t partSize, const LutWork& work, const PartRunner& run)
{
    assert(partSize > 0);
    const size_t numParts = count / partSize + (count % partSize != 0 ? 1 : 0);
    const size_t numWanted =
        work.numThreads != 0 ? work.numThreads : std::max(std::thread::hardware_concurrency(), 1u);
    const size_t numHelpers = std::min(numWanted, std::max(numParts, size_t(1))) - 1;
    Parts parts(count, partSize, run);
    std::vector<std::thread> helpers;
    helpers.reserve(numHelpers);
    try {
        while (helpers.size() < numHelpers)
            helpers.emplace_back([&parts] {
                const WatchPause pause;
                parts.Run([] {});
            });
    } catch (const std::exception&) { // no more threads, or no memory for one
        // The threads that did start do all parts.
    }
    parts.Run(Watch);
    for (std::thread& helper : helpers)
        helper.join();
    parts.ThrowFailure();
}

size_t FindFirstInParts(size_t count, size_t partSize, const LutWork& work, const PartFinder& find)
{
    std::atomic<size_t> first{kNoLut};
    RunInParts(count, partSize, work, [&](size_t begin, size_t end) {
        const size_t place = find(begin, end);
        assert(begin <= place && place <= end);
        size_t known = first;
        while (place < end && place < known && !first.compare_exchange_weak(known, place))
            ;
    });
    return first;
}

} // namespace booleq
