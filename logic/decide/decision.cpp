#include "decision.h"

#include <algorithm>
#include <cassert>

#include "cone.h"
#include "encoder.h"
#include "flatten.h"
#include "gate_graph.h"
#include "joined_inputs.h"
#include "patterns.h"
#include "solver.h"
#include "sweep.h"

namespace booleq {

namespace {

constexpr uint64_t kCheapRowWork = uint64_t(1) << 21; // words computed: some milliseconds
constexpr uint64_t kFirstRowWork = uint64_t(1) << 24; // a first row without the solver
constexpr uint64_t kRandomWork = uint64_t(1) << 20;
constexpr uint64_t kMinRandomWords = 4;
constexpr uint64_t kMaxRandomWords = 256;
constexpr uint64_t kWatchedWork = uint64_t(1) << 16;
constexpr int kFirstConflicts = 2000; // of one question while gates are merged
constexpr int kMaxSweepConflicts = 100000;

// One decision: whether an edge, the exclusive OR of both expressions, is ever 1.
class Decider {
  public:
    Decider(const Side& left, const Side& right, const Limits& limits)
        : m_deadline(limits), m_left(left), m_right(right), m_graph(0)
    {
        m_decision.inputs = left.names;
        m_right_places = JoinInputs(right.names, m_decision.inputs);
        m_graph = GateGraph(static_cast<uint32_t>(m_decision.inputs.size()));
    }

    Decision Run()
    {
        std::vector<Edge> leftInputs;
        for (uint32_t input = 0; input < m_left.names.size(); ++input)
            leftInputs.push_back(m_graph.Input(input));
        std::vector<Edge> rightInputs;
        for (const uint32_t place : m_right_places)
            rightInputs.push_back(m_graph.Input(place));
        const Edge left = m_left.build(leftInputs, m_graph);
        const Edge right = m_right.build(rightInputs, m_graph);
        m_root = m_graph.Xor(left, right);
        Decide();
        assert(m_decision.verdict == Verdict::Undecided || m_decision.reason.empty());
        assert(m_decision.verdict != Verdict::Undecided || !m_decision.reason.empty());
        return m_decision;
    }

  private:
    void Decide()
    {
        if (GateOf(m_root) == 0) {
            if (m_root == kFalseEdge)
                SetEqual(Proof::Structure);
            else
                SetDifferent(std::vector<bool>(m_decision.inputs.size()), Proof::Structure, true);
            return;
        }
        Cone cone(m_graph, m_root);
        if (TryAllRows(cone, kCheapRowWork) || TryRandomRows(cone))
            return;
        if (Solver::IsThere())
            AskSolver();
        else if (cone.Inputs().size() <= kMaxFirstRowInputs)
            TryAllRows(cone, UINT64_MAX);
        else
            SetUndecided("this build has no solver, and for " +
                         std::to_string(cone.Inputs().size()) +
                         " inputs there are too many rows to try");
    }

    void SetEqual(Proof proof)
    {
        m_decision.verdict = Verdict::Equal;
        m_decision.proof = proof;
    }

    void SetUndecided(const std::string& reason)
    {
        assert(m_decision.verdict == Verdict::Undecided);
        m_decision.reason = reason;
    }

    void SetTimeIsOver()
    {
        SetUndecided("out of time");
        m_decision.isTimeOver = true;
    }

    // Sets Different only if the expressions themselves differ there, whatever was built from them.
    void SetDifferent(const std::vector<bool>& assignment, Proof proof, bool isFirstRow)
    {
        assert(assignment.size() == m_decision.inputs.size());
        std::vector<uint64_t> inputs;
        inputs.reserve(assignment.size());
        for (const bool value : assignment)
            inputs.push_back(value ? 1 : 0);
        std::vector<uint64_t> rightInputs;
        for (const uint32_t place : m_right_places)
            rightInputs.push_back(inputs[place]);
        m_decision.left = (m_left.evaluate(inputs) & 1u) != 0;
        m_decision.right = (m_right.evaluate(rightInputs) & 1u) != 0;
        assert(m_decision.left != m_decision.right);
        if (m_decision.left == m_decision.right) {
            SetUndecided("a difference was found that the expressions do not show");
            return;
        }
        m_decision.verdict = Verdict::Different;
        m_decision.proof = proof;
        m_decision.assignment = assignment;
        m_decision.isFirstRow = isFirstRow;
    }

    std::vector<bool> Assignment(const Cone& cone, const std::vector<uint64_t>& inputs,
                                 uint64_t ones) const
    {
        const auto bit = static_cast<unsigned int>(__builtin_ctzll(ones));
        std::vector<bool> assignment(m_decision.inputs.size());
        for (size_t place = 0; place < inputs.size(); ++place)
            assignment[cone.Inputs()[place]] = (inputs[place] >> bit & 1u) != 0;
        return assignment;
    }

    // Inputs that do not matter are 0, so the first row over those that do is the first one.
    // Fails: false if it would take more work. True with a verdict, or when the time ran out.
    bool TryAllRows(Cone& cone, uint64_t maxWork)
    {
        const auto numInputs = static_cast<unsigned int>(cone.Inputs().size());
        if (numInputs > kMaxFirstRowInputs)
            return false;
        const uint64_t numWords = numInputs > 6 ? uint64_t(1) << (numInputs - 6) : 1;
        const uint64_t wordWork = cone.Gates().size() + numInputs + 1;
        const bool isWhole = numWords <= maxWork / wordWork;
        if (!isWhole && maxWork <= kCheapRowWork)
            return false;
        return TryRows(cone, std::min(numWords, maxWork / wordWork), isWhole);
    }

    bool TryRows(Cone& cone, uint64_t numWords, bool isWhole)
    {
        const auto numInputs = static_cast<unsigned int>(cone.Inputs().size());
        const uint64_t wordsPerWatch = kWatchedWork / (cone.Gates().size() + numInputs + 1) + 1;
        std::vector<uint64_t> inputs(numInputs);
        for (uint64_t word = 0; word < numWords; ++word) {
            if (word % wordsPerWatch == 0 && m_deadline.IsOver()) {
                SetTimeIsOver();
                return true;
            }
            for (unsigned int input = 0; input < numInputs; ++input)
                inputs[input] = InputWord(numInputs, input, word);
            if (const uint64_t ones = cone.Evaluate(inputs)) {
                SetDifferent(Assignment(cone, inputs, ones), Proof::Rows, true);
                return true;
            }
        }
        if (isWhole)
            SetEqual(Proof::Rows);
        return isWhole;
    }

    bool TryRandomRows(Cone& cone)
    {
        Patterns patterns(m_graph, cone, m_root);
        std::vector<uint64_t> inputs(cone.Inputs().size());
        const uint64_t wordWork = cone.Gates().size() + inputs.size() + 1;
        const uint64_t numWords =
            std::clamp(kRandomWork / wordWork, kMinRandomWords, kMaxRandomWords);
        for (uint64_t word = 0; word < numWords; ++word) {
            if (m_deadline.IsOver()) {
                SetTimeIsOver();
                return true;
            }
            if (word % 2 == 0)
                patterns.FillAtRandom(inputs);
            else
                patterns.FillAimed(true, inputs);
            const uint64_t ones = cone.Evaluate(inputs);
            if (ones == 0)
                continue;
            FinishDifferent(cone, Assignment(cone, inputs, ones), Proof::RandomRows);
            return true;
        }
        return false;
    }

    void AskSolver()
    {
        for (int conflicts = kFirstConflicts;;
             conflicts = std::min(10 * conflicts, kMaxSweepConflicts)) {
            const Sweep sweep(m_graph, m_root, conflicts, m_deadline);
            if (sweep.Root() == kFalseEdge) {
                SetEqual(Proof::Solver);
                return;
            }
            if (!sweep.Witness().empty()) {
                Cone cone(m_graph, m_root);
                FinishDifferent(cone, sweep.Witness(), Proof::Solver);
                return;
            }
            if (m_deadline.IsOver()) {
                SetTimeIsOver();
                return;
            }
            m_graph = sweep.Graph();
            m_root = sweep.Root();
            if (SolveOnce(conflicts >= kMaxSweepConflicts ? Solver::kNoLimit : 20 * conflicts))
                return;
        }
    }

    // False if the limit on conflicts was reached first.
    bool SolveOnce(int maxConflicts)
    {
        Solver solver(Solver::Effort::Thorough, m_deadline);
        Encoder encoder(m_graph, solver);
        solver.Add({encoder.LiteralOf(m_root)});
        const Solver::Answer answer = solver.Solve({}, maxConflicts);
        if (answer == Solver::Answer::Unsatisfiable) {
            SetEqual(Proof::Solver);
            return true;
        }
        if (answer == Solver::Answer::Unknown) {
            if (!m_deadline.IsOver())
                return false;
            SetTimeIsOver();
            return true;
        }
        std::vector<bool> assignment;
        for (uint32_t gate = 1; gate <= m_graph.NumInputs(); ++gate) {
            const int variable = encoder.VariableOf(gate);
            assignment.push_back(variable != 0 && solver.Value(variable));
        }
        Cone cone(m_graph, m_root);
        FinishDifferent(cone, assignment, Proof::Solver);
        return true;
    }

    // There is a difference; with few inputs it must be the first one.
    void FinishDifferent(Cone& cone, const std::vector<bool>& assignment, Proof proof)
    {
        if (m_decision.inputs.size() > kMaxFirstRowInputs) {
            SetDifferent(assignment, proof, false);
            return;
        }
        const uint64_t maxWork = Solver::IsThere() ? kFirstRowWork : UINT64_MAX;
        if (!TryAllRows(cone, maxWork)) {
            std::vector<bool> first = assignment;
            const bool isFirst = LowerToFirst(first);
            SetDifferent(first, proof, isFirst);
        } else if (m_decision.verdict == Verdict::Undecided) { // out of time: a later row will do
            m_decision.reason.clear();
            m_decision.isTimeOver = false;
            SetDifferent(assignment, proof, false);
        }
        assert(m_decision.verdict != Verdict::Equal);
    }

    // Input by input, the most significant first: 0 if some difference has 0 there, otherwise 1.
    // Fails: false if time runs out first; the assignment is a difference in any case.
    bool LowerToFirst(std::vector<bool>& assignment)
    {
        Solver solver(Solver::Effort::Thorough, m_deadline);
        Encoder encoder(m_graph, solver);
        solver.Add({encoder.LiteralOf(m_root)});
        for (uint32_t input = 0; input < m_graph.NumInputs(); ++input) {
            const int variable = encoder.VariableOf(input + 1);
            if (variable == 0) {
                assignment[input] = false;
                continue;
            }
            if (assignment[input]) {
                const Solver::Answer answer = solver.Solve({-variable});
                if (answer == Solver::Answer::Unknown)
                    return false;
                if (answer == Solver::Answer::Satisfiable)
                    for (uint32_t later = input; later < m_graph.NumInputs(); ++later) {
                        const int other = encoder.VariableOf(later + 1);
                        assignment[later] = other != 0 && solver.Value(other);
                    }
            }
            solver.Add({assignment[input] ? variable : -variable});
        }
        return true;
    }

    Deadline m_deadline;
    const Side& m_left;
    const Side& m_right;
    std::vector<uint32_t> m_right_places;
    GateGraph m_graph;
    Edge m_root = kFalseEdge; // 1 if they differ
    Decision m_decision;
};

} // namespace

uint64_t Decision::Row() const
{
    assert(verdict == Verdict::Different && assignment.size() <= 64);
    uint64_t row = 0;
    for (const bool value : assignment)
        row = 2 * row + (value ? 1 : 0);
    return row;
}

Side SideOf(const Expression& expression)
{
    return {expression.names,
            [&expression](const std::vector<Edge>& inputs, GateGraph& graph) {
                return AddExpression(expression, inputs, graph);
            },
            [&expression](const std::vector<uint64_t>& inputs) {
                std::vector<uint64_t> stack;
                return EvaluateWord(expression, inputs, stack);
            }};
}

Decision DecideEqual(const Side& left, const Side& right, const Limits& limits)
{
    return Decider(left, right, limits).Run();
}

Decision DecideEqual(const Expression& left, const Expression& right, const Limits& limits)
{
    return DecideEqual(SideOf(left), SideOf(right), limits);
}

Decision DecideConstant(const Expression& expression, bool value, const Limits& limits)
{
    Expression constant;
    constant.names = expression.names;
    AddConstant(constant, value);
    return DecideEqual(expression, constant, limits);
}

} // namespace booleq
