// A way to end long work: an interrupt, a deadline.
//
//     struct Late {
//     };
//     kq_logic::SetWatch([] { throw Late(); });
//     try {
//         kq_logic::Function function;
//         function.Set(Kq_BoolEquation("A ^ B"));
//     } catch (const Late&) {
//         std::cout << "ended" << '\n'; // ended
//     }
//     kq_logic::SetWatch(nullptr);
#ifndef KQ_LOGIC_WATCH_H
#define KQ_LOGIC_WATCH_H

#include <kq_logic/function.h>

namespace kq_logic {

// Called every few milliseconds by long work, on the thread that does it (less often for equations
// of over 100,000 operators). If it throws, the work ends and no object is left half changed.
typedef void (*Watcher)();

// Null, as at first: nobody watches.  Threads: at any time; work under way takes the new watcher.
KQ_EXPORT void SetWatch(Watcher watcher);

} // namespace kq_logic

#endif
