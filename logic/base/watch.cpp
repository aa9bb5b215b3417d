// Who watches long work.
#include "watch.h"

namespace booleq {

namespace {

Watcher current = nullptr;
thread_local unsigned int numPauses = 0;

} // namespace

void SetWatch(Watcher watcher)
{
    current = watcher;
}

void Watch()
{
    if (current && numPauses == 0)
        current();
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
