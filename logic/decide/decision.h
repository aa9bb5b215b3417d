// Whether two expressions are one function, over any number of inputs. Expressions enter; a proved
// yes, a difference that both expressions were evaluated for, or the reason why neither was found
// leaves. Nothing is guessed. Example:
//
//     const Decision decision = DecideEqual(left, right, Limits{10.0});
//     if (decision.verdict == Verdict::Different)
//         Show(decision.inputs, decision.assignment);
//
// In this order: the same operands in another order or grouping; all rows, where they are few;
// random rows; a solver, on gates of which equal ones were joined first. Two calls with the same
// expressions do the same, unless the time ends one.
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

// What brought the verdict.
enum class Proof { None, Structure, Rows, RandomRows, Solver };

struct Decision {
    Verdict verdict = Verdict::Undecided;
    Proof proof = Proof::None;
    std::vector<std::string> inputs; // those of the left one, then what only the right one has
    // Where they differ, a value for each of the inputs; otherwise empty.
    std::vector<bool> assignment;
    bool isFirstRow = false; // no row before that assignment differs
    bool left = false;       // the values there
    bool right = false;
    std::string reason;      // not empty: why it is undecided
    bool isTimeOver = false; // which is the reason

    bool IsEqual() const { return verdict == Verdict::Equal; }
    bool IsDifferent() const { return verdict == Verdict::Different; }

    // The assignment as a row number.  Requires: Different, at most 64 inputs.
    uint64_t Row() const;
};

// Up to so many inputs the difference is the first row that differs, unless the time ends the
// search for it.
constexpr size_t kMaxFirstRowInputs = 30;

// What is compared, when it is not one expression: how its gates are built, and, apart from that,
// what its values are.
struct Side {
    std::vector<std::string> names; // of the inputs, all different
    // The function's edge, from those of the inputs.
    std::function<Edge(const std::vector<Edge>&, GateGraph&)> build;
    WordFunction evaluate;
};
// Requires: the expression has a node; it outlives the side.
Side SideOf(const Expression& expression);

// Inputs are the same when their names are.
// Fails: Undecided, when out of time or this build has no solver and more than
// kMaxFirstRowInputs inputs matter; what the watcher throws goes through.
// Cost: O(n log n) for n nodes of the same operators and operands; exponential at worst.
Decision DecideEqual(const Side& left, const Side& right, const Limits& limits);
Decision DecideEqual(const Expression& left, const Expression& right, const Limits& limits);

// Whether the expression always has the value: Different is an assignment where it has the other.
Decision DecideConstant(const Expression& expression, bool value, const Limits& limits);

} // namespace booleq

#endif
