// The interpreter's lock: given up while the library works, taken again to ask whether to go on.
// In: work that touches no object of Python; out: what it gives.
// Fails: what the work throws, and what a signal's handler raises, within a twentieth of a second.
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

// Work that takes no longer than this in nanoseconds, roughly, keeps the lock: giving it up may
// cost a switch to another thread.
constexpr double kShortWork = 20e3;

// Gives up the lock while it lives.  Requires: this thread has it, and no other Unlocked.
class Unlocked {
  public:
    Unlocked();
    ~Unlocked();
    Unlocked(const Unlocked&) = delete;
    Unlocked& operator=(const Unlocked&) = delete;
};

// A handler raised; the exception waits in the thread's state.
struct Interrupted {};

// Runs the handlers of signals that came, at most every few milliseconds: the watcher of logic/.
// Does nothing on threads that Python does not know.
// Fails: Interrupted on a thread without the lock, otherwise the exception itself.
void CheckSignals();

// Makes CheckSignals the watcher, and knows main thread and forks. Once.
void PrepareInterrupts();

// Calls 'work' with the lock given up.
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

// The same for short work, which keeps the lock.
template <class Work>
auto FreelyIf(bool isLong, const Work& work) -> decltype(work())
{
    if (isLong)
        return Freely(work);
    return work();
}

// Starts a thread that the interpreter waits for when it ends. Once 'isAbandoned' is set, what asks
// the watcher on that thread ends by Interrupted.
typedef std::shared_ptr<std::atomic<bool>> AbandonFlag;
void StartBeside(const AbandonFlag& isAbandoned, std::function<void()> work);

// Calls work, parts of which cannot be ended, on a thread of its own. When a handler raises, nobody
// waits for its result any more.
// Requires: it has copies of, or shares, all that it uses.
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

// How long work takes: no longer than kShortWork; longer, but with a check of signals every few
// milliseconds; or with steps between two checks that somebody would wait for.
enum class Length { Short, Long, Endless };

// Calls work with the lock, without it, or beside.  Requires: as of Beside.
template <class Work>
auto Run(Length length, const Work& work) -> decltype(work())
{
    if (length == Length::Endless)
        return Beside(work);
    return FreelyIf(length == Length::Long, work);
}

// The same for what is never short.
template <class Work>
auto RunLong(Length length, const Work& work) -> decltype(work())
{
    return Run(std::max(length, Length::Long), work);
}

} // namespace booleq_python

#endif
