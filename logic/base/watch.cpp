// Who watches long work.
#include "watch.h"

namespace booleq {

namespace {

Watcher current = nullptr;

} // namespace

void SetWatch(Watcher watcher)
{
    current = watcher;
}

void Watch()
{
    if (current)
        current();
}

bool WatchAndGoOn(void* /*context*/)
{
    Watch();
    return true;
}

} // namespace booleq
