// The gates that one edge depends on, as a list that is evaluated from front to back, 64 rows at a
// time.
#ifndef BOOLEQ_DECIDE_CONE_H
#define BOOLEQ_DECIDE_CONE_H

#include <cstdint>
#include <vector>

#include "gate_graph.h"

namespace booleq {

// Invariants: operands come before their gates; Inputs() are numbers of inputs, ascending.
class Cone {
  public:
    // Cost: O(gates of the graph up to the edge's gate).
    Cone(const GateGraph& graph, Edge root);

    // Numbers of gates in the graph, ascending, without the constant and the inputs.
    const std::vector<uint32_t>& Gates() const { return m_gates; }
    const std::vector<uint32_t>& Inputs() const { return m_inputs; }

    // The root's values for given values of Inputs().  Threads: one at a time.
    uint64_t Evaluate(const std::vector<uint64_t>& inputs);

  private:
    struct Step {
        bool isXor;
        Edge left; // as places in m_values: the constant, the inputs, the gates
        Edge right;
    };
    uint64_t ValueOf(Edge edge) const
    {
        return m_values[GateOf(edge)] ^ (IsInverted(edge) ? ~uint64_t(0) : 0);
    }

    std::vector<uint32_t> m_gates;
    std::vector<uint32_t> m_inputs;
    std::vector<Step> m_steps;
    std::vector<uint64_t> m_values;
    Edge m_root;
};

} // namespace booleq

#endif
