// A way out of long work for whoever embeds it: an interrupt, a deadline.
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

// Called every few milliseconds by whatever takes long, for equations of over 100,000 operators
// less often. It may throw, which ends the work; nothing is left half done.
typedef void (*Watcher)();

// Null: nobody watches, as at first.
KQ_EXPORT void SetWatch(Watcher watcher);

} // namespace kq_logic

#endif
