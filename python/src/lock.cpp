#include "lock.h"

#include <atomic>
#include <cassert>
#include <condition_variable>
#include <mutex>
#include <new>
#include <thread>

#include "watch.h"

namespace booleq_python {

namespace {

typedef std::chrono::steady_clock Clock;

constexpr std::chrono::milliseconds kBetweenChecks(10);

thread_local PyThreadState* released = nullptr; // set on a thread that has released the lock
thread_local Clock::time_point lastCheck;
thread_local const std::atomic<bool>* abandoned = nullptr; // set on a thread of StartBeside

std::atomic<unsigned long> mainThread{0};

// Counts the threads of StartBeside. Never destroyed, because they may outlive static objects.
struct Helpers {
    std::mutex mutex;
    std::condition_variable isFewer;
    size_t number = 0;
};

Helpers& GetHelpers()
{
    static auto* const helpers = new Helpers();
    return *helpers;
}

void WaitForHelpers()
{
    const Unlocked unlocked;
    Helpers& helpers = GetHelpers();
    std::unique_lock<std::mutex> guard(helpers.mutex);
    helpers.isFewer.wait(guard, [&] { return helpers.number == 0; });
}

void CountHelper(bool isNew)
{
    Helpers& helpers = GetHelpers();
    const std::lock_guard<std::mutex> guard(helpers.mutex);
    assert(isNew || helpers.number > 0);
    if (isNew)
        ++helpers.number;
    else
        --helpers.number;
    helpers.isFewer.notify_all();
}

// A forked child has only the thread that forked.
void ForgetThreads()
{
    mainThread = PyThread_get_thread_ident();
    new (&GetHelpers()) Helpers(); // its mutex may be held by a thread that is gone
}

} // namespace

Unlocked::Unlocked()
{
    assert(!released);
    lastCheck = Clock::now();
    released = PyEval_SaveThread();
}

Unlocked::~Unlocked()
{
    PyEval_RestoreThread(std::exchange(released, nullptr));
}

void CheckSignals()
{
    const Clock::time_point now = Clock::now();
    if (now - lastCheck < kBetweenChecks)
        return;
    lastCheck = now;
    if (abandoned && *abandoned)
        throw Interrupted();
    if (PyThread_get_thread_ident() != mainThread)
        return; // only the main thread runs handlers
    if (released) {
        PyEval_RestoreThread(released);
        const bool isEnded = PyErr_CheckSignals() != 0;
        released = PyEval_SaveThread();
        if (isEnded)
            throw Interrupted();
        return;
    }
    PyThreadState* const own = PyGILState_GetThisThreadState();
    if (own && own == _PyThreadState_UncheckedGet() && PyErr_CheckSignals() != 0)
        throw py::error_already_set();
}

void PrepareInterrupts()
{
    const py::object main = py::module_::import("threading").attr("main_thread")();
    mainThread = main.attr("ident").cast<unsigned long>();
    py::module_::import("atexit").attr("register")(py::cpp_function(&WaitForHelpers));
    py::module_::import("os").attr("register_at_fork")(py::arg("after_in_child") =
                                                           py::cpp_function(&ForgetThreads));
    booleq::SetWatch(CheckSignals);
}

void StartBeside(const AbandonFlag& isAbandoned, std::function<void()> work)
{
    CountHelper(true);
    try {
        std::thread([isAbandoned, work = std::move(work)]() mutable {
            abandoned = isAbandoned.get();
            work();
            work = nullptr; // frees what it holds before the thread counts as ended
            CountHelper(false);
        }).detach();
    } catch (...) { // the system refused a thread, usually for lack of memory
        CountHelper(false);
        throw std::bad_alloc();
    }
}

} // namespace booleq_python
