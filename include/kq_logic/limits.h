// How long a call may take.
//
//     kq_logic::Limits limits;
//     limits.seconds = 0.5;
//     std::cout << limits.seconds << '\n'; // 0.5
#ifndef KQ_LOGIC_LIMITS_H
#define KQ_LOGIC_LIMITS_H

namespace kq_logic {

// When unfinished work ends.
struct Limits {
    double seconds = 0; // 0: as long as it takes
};

} // namespace kq_logic

#endif
