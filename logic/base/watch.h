// A way out of long work for whoever embeds it: a terminal's interrupt, a deadline.
#ifndef BOOLEQ_BASE_WATCH_H
#define BOOLEQ_BASE_WATCH_H

#include <cstdint>

namespace booleq {

// Called by whatever takes long, columns, comparisons and searches: every few milliseconds, for
// expressions of over 100,000 operators less often. It may throw, which ends the work; nothing is
// left half done.  Null: nobody watches, as at first.
typedef void (*Watcher)();
void SetWatch(Watcher watcher);

void Watch();

// As long as one lives, Watch() does nothing in its thread: a watcher is called in the thread that
// a caller waits in, not in those that help it.
class WatchPause {
  public:
    WatchPause();
    ~WatchPause();
    WatchPause(const WatchPause&) = delete;
    WatchPause& operator=(const WatchPause&) = delete;
};

// Every how many words Watch is called where a word's cost is anybody's.
constexpr uint64_t kWatchedWords = 16;

// Watch() for Kq_BoolEquation::GetColumn; always true.
bool WatchAndGoOn(void* context);

} // namespace booleq

#endif
