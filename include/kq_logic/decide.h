// Whether two equations are one function, and whether one ever has a value.
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

// A verdict and what supports it.
struct Decision {
    Verdict verdict = Verdict::Undecided; // only Equal and Different are answers
    std::string reason;                   // not empty: why it is undecided
    bool isTimeOver = false;              // which is that a limit ended it
    std::vector<std::string> inputs;      // those of the left one, then what only the right one has
    std::vector<bool> assignment;         // where they differ, a value for each of the inputs
    bool isFirstRow = false;              // no row before that assignment differs
    bool left = false;                    // the left one's value there
    bool right = false;                   // the right one's
};

// Inputs are the same when their names are; there may be any number. Nothing is guessed: Equal is
// proved, and for a difference both were evaluated. It is the first row up to kMaxFunctionInputs.
// Fails: Undecided, without an equation, where a limit ends it, and, in a library built without a
// solver, where only that could tell.  Cost: exponential at worst.
KQ_EXPORT Decision DecideEqual(const Kq_BoolEquation& left, const Kq_BoolEquation& right,
                               const Limits& limits = Limits());

// Whether the equation always has 'value'. Different: the assignment is one where it has the other,
// so an equation is satisfiable when it is Different from 0.
KQ_EXPORT Decision DecideConstant(const Kq_BoolEquation& equation, bool value,
                                  const Limits& limits = Limits());

} // namespace kq_logic

#endif
