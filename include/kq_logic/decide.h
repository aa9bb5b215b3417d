// Whether two equations are the same function, and whether one is ever 0 or 1.
//
//     const Kq_BoolEquation left("~(A & B)");
//     const Kq_BoolEquation right("~A | ~B");
//     kq_logic::Decision decision = kq_logic::DecideEqual(left, right);
//     std::cout << (decision.verdict == kq_logic::Verdict::Equal) << '\n'; // 1
//     decision = kq_logic::DecideEqual(left, Kq_BoolEquation("~A"));
//     std::cout << decision.inputs[1] << decision.assignment[1] << '\n'; // B0
#ifndef KQ_LOGIC_DECIDE_H
#define KQ_LOGIC_DECIDE_H

#include <string>
#include <vector>

#include <kq_logic/function.h>
#include <kq_logic/limits.h>

namespace kq_logic {

// What is known.
enum class Verdict {
    Equal,     // proved
    Different, // there is an assignment where they differ
    Undecided  // neither was found
};

// A verdict and its evidence.
struct Decision {
    Verdict verdict = Verdict::Undecided; // only Equal and Different are answers
    std::string reason;                   // why it is undecided; empty if it is decided
    bool isTimeOver = false;              // undecided because of the time limit
    std::vector<std::string> inputs;      // of the left equation, then those only the right one has
    std::vector<bool> assignment;         // where they differ: a value for each input
    bool isFirstRow = false;              // no earlier row differs
    bool left = false;                    // the left equation's value there
    bool right = false;                   // the right equation's value there
};

// Inputs with the same name are the same input; there may be any number. Equal is always proved,
// and a difference was evaluated on both sides. Up to kMaxFunctionInputs it is the first row that
// differs. Fails: Undecided if an equation is empty, if the limit ends the search, or if only a
// solver could tell and the library was built without one.  Cost: exponential in the worst case.
KQ_EXPORT Decision DecideEqual(const Kq_BoolEquation& left, const Kq_BoolEquation& right,
                               const Limits& limits = Limits());

// Whether the equation always has 'value'. If not (Different), the assignment is one where it has
// the other value; so an equation is satisfiable exactly if it is Different from 0.
KQ_EXPORT Decision DecideConstant(const Kq_BoolEquation& equation, bool value,
                                  const Limits& limits = Limits());

} // namespace kq_logic

#endif
