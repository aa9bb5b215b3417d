// The interpreter's lock: released while the library works, and taken again to check for signals.
// In: work that touches no Python object; out: its result.
// Fails: what the work throws, and what a signal handler raises, within a twentieth of a second.
#ifndef BOOLEQ_PYTHON_LOCK_H
#define BOOLEQ_PYTHON_LOCK_H

#include <algorithm>
#include <atomic>
#include <chrono>
#include <functional>
#include <future>
#include <memory>
#include <utility>

#include <pybind11/pybind11.h>

namespace booleq_python {

namespace py = pybind11;

// Work that takes no more than about so many nanoseconds keeps the lock: releasing it may cost a
// switch to another thread.
constexpr double kShortWork = 20e3;

// Releases the lock for its own lifetime.  Requires: this thread holds the lock and has no other
// Unlocked.
class Unlocked {
  public:
    Unlocked();
    ~Unlocked();
    Unlocked(const Unlocked&) = delete;
    Unlocked& operator=(const Unlocked&) = delete;
};

// Thrown when a signal handler raised; the Python exception is in the thread's state.
struct Interrupted {};

// Runs the handlers of pending signals, at most every ten milliseconds; it is what Watch() calls.
// On other threads than the main one, it only checks whether the work is abandoned.
// Fails: Interrupted on a thread without the lock or an abandoned one, otherwise the exception
// itself.
void CheckSignals();

// Makes Watch() call CheckSignals, and keeps track of the main thread and of forks. Call it once.
void PrepareInterrupts();

// Calls 'work' with the lock released.
template <class Work>
auto Freely(const Work& work) -> decltype(work())
{
    try {
        const Unlocked unlocked;
        return work();
    } catch (const Interrupted&) {
        throw py::error_already_set();
    }
}

// The same, except that short work keeps the lock.
template <class Work>
auto FreelyIf(bool isLong, const Work& work) -> decltype(work())
{
    if (isLong)
        return Freely(work);
    return work();
}

// Starts a thread; the interpreter waits for it before it ends. Once 'isAbandoned' is set, Watch()
// throws Interrupted on that thread.
typedef std::shared_ptr<std::atomic<bool>> AbandonFlag;
void StartBeside(const AbandonFlag& isAbandoned, std::function<void()> work);

// Runs work that cannot always be interrupted on a separate thread. If a handler raises, the result
// is abandoned.
// Requires: 'work' owns or shares everything that it uses.
template <class Work>
auto Beside(const Work& work) -> decltype(work())
{
    typedef decltype(work()) Result;
    const auto task = std::make_shared<std::packaged_task<Result()>>(work);
    std::future<Result> result = task->get_future();
    const auto isAbandoned = std::make_shared<std::atomic<bool>>(false);
    return Freely([&] {
        StartBeside(isAbandoned, [task] { (*task)(); });
        try {
            while (result.wait_for(std::chrono::milliseconds(20)) != std::future_status::ready)
                CheckSignals();
        } catch (const Interrupted&) {
            *isAbandoned = true;
            throw;
        }
        return result.get();
    });
}

// How long work takes: at most kShortWork; longer, but checking signals every few milliseconds; or
// with so long between two checks that a user would notice.
enum class Length { Short, Long, Endless };

// Calls 'work' with the lock, without it, or on a separate thread.  Requires: as for Beside.
template <class Work>
auto Run(Length length, const Work& work) -> decltype(work())
{
    if (length == Length::Endless)
        return Beside(work);
    return FreelyIf(length == Length::Long, work);
}

// The same for work that is never short.
template <class Work>
auto RunLong(Length length, const Work& work) -> decltype(work())
{
    return Run(std::max(length, Length::Long), work);
}

} // namespace booleq_python

#endif
