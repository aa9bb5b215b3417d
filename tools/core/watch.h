// A way out of long work for whoever embeds it: a terminal's interrupt, a deadline.
#ifndef BOOLEQ_CORE_WATCH_H
#define BOOLEQ_CORE_WATCH_H

namespace booleq {

// Called every few milliseconds by whatever takes long: columns, comparisons, searches. It may
// throw, which ends the work; nothing is left half done.  Null: nobody watches, as at first.
typedef void (*Watcher)();
void SetWatch(Watcher watcher);

void Watch();

// Watch() for Kq_BoolEquation::GetColumn; always true.
bool WatchAndGoOn(void* context);

} // namespace booleq

#endif
