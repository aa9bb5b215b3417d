// Whether two functions are the same up to the order of their inputs, or also up to inversions.
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

constexpr size_t kMaxMatchedInputs = 16; // inputs with an effect; more are refused

// What may differ.
enum class MatchScope {
    Order,             // only the order of the inputs
    OrderAndInversions // also inversions of inputs and of the output
};

// second(x) = first(y), inverted if isInverted, where y[sources[k]] is x[k], inverted if
// inverted[k]. Inputs without effect have no counterpart.
struct Matching {
    static constexpr unsigned int kIdle = static_cast<unsigned int>(-1); // instead of a source

    std::string fault;                 // not empty: too many inputs
    bool isFound = false;              // if so, the other members hold the mapping
    bool isDecided = true;             // false: time ran out before anything was found
    std::vector<unsigned int> sources; // for each input of the second function, one of the first
    std::vector<bool> inverted;        // whether that input is inverted
    bool isInverted = false;           // whether the output is inverted
};

// A mapping is applied and compared row by row before it is returned. Matches without inversions
// are tried first. Fails: fault, with more than kMaxMatchedInputs inputs with an effect; undecided,
// if the limit ends the search.  Cost: usually some milliseconds; functions that are nearly alike
// without being symmetric can take as many tries as there are orders.
KQ_EXPORT Matching Match(const Function& first, const Function& second, MatchScope scope,
                         const Limits& limits = Limits());

// The first function after the mapping, over 'inputs'.
// Requires: a mapping found for this function and one of inputs.size() inputs; different names.
KQ_EXPORT Function Apply(const Matching& matching, const Function& first,
                         const std::vector<std::string>& inputs);

} // namespace kq_logic

#endif
