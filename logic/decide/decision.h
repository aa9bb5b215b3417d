// Whether two expressions are the same function, over any number of inputs. Expressions enter. A
// proved yes, a difference for which both expressions were evaluated, or the reason why neither was
// found leaves. Nothing is guessed.
#ifndef BOOLEQ_DECIDE_DECISION_H
#define BOOLEQ_DECIDE_DECISION_H

#include <cstdint>
#include <functional>
#include <string>
#include <vector>

#include "deadline.h"
#include "expression.h"
#include "gate_graph.h"

namespace booleq {

enum class Verdict { Equal, Different, Undecided };

// What settled the verdict.
enum class Proof { None, Structure, Rows, RandomRows, Solver };

struct Decision {
    Verdict verdict = Verdict::Undecided;
    Proof proof = Proof::None;
    std::vector<std::string> inputs; // those of the left one, then the new ones of the right one
    // If they differ, a value for each of the inputs; otherwise empty.
    std::vector<bool> assignment;
    bool isFirstRow = false; // no row before that assignment differs
    bool left = false;       // the values of both sides there
    bool right = false;
    std::string reason;      // if not empty: why it is undecided
    bool isTimeOver = false; // this is the reason

    bool IsEqual() const { return verdict == Verdict::Equal; }
    bool IsDifferent() const { return verdict == Verdict::Different; }

    // The assignment as a row number.  Requires: Different, at most 64 inputs.
    uint64_t Row() const;
};

// With up to so many inputs the difference is the first row that differs, unless time runs out
// while it is searched for.
constexpr size_t kMaxFirstRowInputs = 30;

// One side of a comparison that is not an expression: how to build its gates and, independently of
// that, how to compute its values.
struct Side {
    std::vector<std::string> names; // of the inputs, all different
    // Builds the edge of the function from the edges of the inputs.
    std::function<Edge(const std::vector<Edge>&, GateGraph&)> build;
    WordFunction evaluate;
};
// Requires: the expression has a node; it outlives the side.
Side SideOf(const Expression& expression);

// Whether both sides are the same function. Example:
//
//     const Decision decision = DecideEqual(left, right, Limits{10.0});
//     if (decision.verdict == Verdict::Different)
//         Show(decision.inputs, decision.assignment);
//
// It tries in this order: the same operands in another order or grouping; all rows, if there are
// few; random rows; the solver, after equal gates have been merged. Two calls with the same
// expressions do the same, unless the time runs out. Inputs with the same name are the same.
// Fails: Undecided if the time runs out, or if this build has no solver and more than
// kMaxFirstRowInputs inputs matter; what the watcher throws is passed on.
// Cost: O(n log n) for n nodes if both have the same operators and operands; exponential at worst.
Decision DecideEqual(const Side& left, const Side& right, const Limits& limits);
Decision DecideEqual(const Expression& left, const Expression& right, const Limits& limits);

// Whether the expression always has the value; Different gives an assignment for which it does not.
Decision DecideConstant(const Expression& expression, bool value, const Limits& limits);

} // namespace booleq

#endif
