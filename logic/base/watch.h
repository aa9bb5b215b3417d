// Lets the embedding program stop long work: a terminal's interrupt, a deadline.
#ifndef BOOLEQ_BASE_WATCH_H
#define BOOLEQ_BASE_WATCH_H

#include <cstdint>

namespace booleq {

// Called by everything that may take long (columns, comparisons, searches) every few milliseconds;
// less often for expressions of over 100,000 operators. It may throw, which ends the work; nothing
// is left half done.  Null, as at first: nobody watches.
typedef void (*Watcher)();
void SetWatch(Watcher watcher);

void Watch();

// While one exists, Watch() does nothing in its thread: a watcher is called in the thread in which
// a caller waits, not in those that help it.
class WatchPause {
  public:
    WatchPause();
    ~WatchPause();
    WatchPause(const WatchPause&) = delete;
    WatchPause& operator=(const WatchPause&) = delete;
};

// Watch is called once in so many words where a word may cost any amount of time.
constexpr uint64_t kWatchedWords = 16;

// Watch() for Kq_BoolEquation::GetColumn; always true.
bool WatchAndGoOn(void* context);

} // namespace booleq

#endif
