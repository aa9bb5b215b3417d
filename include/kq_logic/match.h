// Whether two functions are one up to the order of inputs, or up to inversions.
//
//     kq_logic::Function first;
//     kq_logic::Function second;
//     first.Set(Kq_BoolEquation("a & ~b"));
//     second.Set(Kq_BoolEquation("x ~| y"));
//     const kq_logic::Matching matching =
//         kq_logic::Match(first, second, kq_logic::MatchScope::OrderAndInversions);
//     std::cout << matching.isFound << '\n'; // 1
//     std::cout << (kq_logic::Apply(matching, first, second.Inputs()) == second) << '\n'; // 1
#ifndef KQ_LOGIC_MATCH_H
#define KQ_LOGIC_MATCH_H

#include <string>
#include <vector>

#include <kq_logic/function.h>
#include <kq_logic/limits.h>

namespace kq_logic {

constexpr size_t kMaxMatchedInputs = 16; // that have an effect; more are refused

// What may differ.
enum class MatchScope {
    Order,             // the order of inputs alone
    OrderAndInversions // and inversions of inputs and of the output
};

// second(x) = first(y), inverted if isInverted, where y[sources[k]] is x[k], inverted if
// inverted[k]. Inputs without effect have no counterpart.
struct Matching {
    static constexpr unsigned int kIdle = static_cast<unsigned int>(-1); // instead of a source

    std::string fault;                 // not empty: too many inputs
    bool isFound = false;              // what follows says how
    bool isDecided = true;             // false: the time was up first, and nothing is found
    std::vector<unsigned int> sources; // of the first function's inputs, one for each of the second
    std::vector<bool> inverted;        // an input of the second function is taken inverted
    bool isInverted = false;           // the result is
};

// What is found was applied and compared, row by row. A match without inversions is looked for
// first.
// Fails: fault, for more than kMaxMatchedInputs inputs with an effect; not decided, where a limit
// ends it.  Cost: some milliseconds as a rule; functions that are all but alike, without being
// symmetric, can take as many tries as there are orders.
KQ_EXPORT Matching Match(const Function& first, const Function& second, MatchScope scope,
                         const Limits& limits = Limits());

// What a matching makes of the first function, over 'inputs'.
// Requires: it was found for this function and one of as many inputs as there are names, which are
// all different.
KQ_EXPORT Function Apply(const Matching& matching, const Function& first,
                         const std::vector<std::string>& inputs);

} // namespace kq_logic

#endif
