// The watcher of long work, and the threads that do not call it.
#include "watch.h"

#include <atomic>

namespace booleq {

namespace {

std::atomic<Watcher> current = nullptr;
thread_local unsigned int numPauses = 0;

} // namespace

void SetWatch(Watcher watcher)
{
    current = watcher;
}

void Watch()
{
    const Watcher watcher = current;
    if (watcher && numPauses == 0)
        watcher();
}

WatchPause::WatchPause()
{
    ++numPauses;
}

WatchPause::~WatchPause()
{
    --numPauses;
}

bool WatchAndGoOn(void* /*context*/)
{
    Watch();
    return true;
}

} // namespace booleq
