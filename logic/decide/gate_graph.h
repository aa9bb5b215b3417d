// A graph of AND and exclusive-OR gates, each of which exists once: operands enter, an edge leaves.
// Gates that are easily seen to be one function become one edge while the graph is built, as in
// Kuehlmann, Paruthi, Krohm and Ganai, "Robust Boolean Reasoning for Equivalence Checking and
// Functional Property Verification", IEEE TCAD 21(12), 2002. Fails: std::bad_alloc only, or an
// assert above 2^31 gates.  Cost: constant time for each gate.
#ifndef BOOLEQ_DECIDE_GATE_GRAPH_H
#define BOOLEQ_DECIDE_GATE_GRAPH_H

#include <cstddef>
#include <cstdint>
#include <vector>

namespace booleq {

// A gate's output or its inverse: 2 * gate + (1 if inverted).
typedef uint32_t Edge;

constexpr Edge kFalseEdge = 0; // gate 0 is the constant
constexpr Edge kTrueEdge = 1;

constexpr Edge Inverse(Edge edge)
{
    return edge ^ 1u;
}
constexpr Edge InvertedIf(Edge edge, bool isInverted)
{
    return edge ^ (isInverted ? 1u : 0u);
}
constexpr bool IsInverted(Edge edge)
{
    return (edge & 1u) != 0;
}
constexpr uint32_t GateOf(Edge edge)
{
    return edge / 2;
}
constexpr Edge OutputOf(uint32_t gate)
{
    return 2 * gate;
}

enum class GateKind : uint8_t { Constant, Input, And, Xor };

struct Gate {
    GateKind kind;
    Edge left; // an input's number
    Edge right;
};

// Invariants:
// 1. Gate 0 is the constant 0, gates 1 to NumInputs() are the inputs; any other gate comes after
// 2. The operands of a gate are two different gates, neither the constant, left below right; those
//    of an exclusive OR are not inverted.
// 3. No two gates have the same kind and operands.
class GateGraph {
  public:
    explicit GateGraph(uint32_t numInputs);

    uint32_t NumInputs() const { return m_num_inputs; }
    uint32_t NumGates() const { return static_cast<uint32_t>(m_gates.size()); }
    const Gate& At(uint32_t gate) const { return m_gates[gate]; }
    Edge Input(uint32_t input) const { return OutputOf(input + 1); }

    Edge And(Edge left, Edge right);
    Edge Or(Edge left, Edge right) { return Inverse(And(Inverse(left), Inverse(right))); }
    Edge Xor(Edge left, Edge right);

    // A chain of gates over all operands, which are left sorted: the same operands in another
    // order, or repeated ones, give the same edge. For an exclusive OR it matters how often each
    // operand occurs.
    // Cost: O(n log n) for n operands.
    Edge AndOfAll(Edge* first, Edge* last);
    Edge XorOfAll(Edge* first, Edge* last);

  private:
    Edge XorOfOperands(const Gate& gate);
    Edge FindOrAdd(GateKind kind, Edge left, Edge right);
    Edge* Slot(GateKind kind, Edge left, Edge right);
    Edge Find(GateKind kind, Edge left, Edge right);
    void Grow();
    bool IsGate(Edge edge, GateKind kind) const { return m_gates[GateOf(edge)].kind == kind; }
    Edge* JoinExclusive(Edge* first, Edge* last);

    // What an AND of two operands is if it needs no gate; see the source.
    struct Folding {
        bool isResult;
        Edge result;
    };
    bool FoldPair(Edge& left, Edge& right, Folding& folding) const;
    bool FoldInto(Edge side, Edge& other, Folding& folding) const;
    bool FoldGates(Edge left, Edge& right, Folding& folding) const;

    uint32_t m_num_inputs;
    std::vector<Gate> m_gates;
    std::vector<Edge> m_slots; // outputs of gates by hash, 0 if empty; a power of two of them
};

} // namespace booleq

#endif
