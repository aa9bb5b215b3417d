// Gates become clauses of a solver: the gates that an edge depends on, when the edge is first asked
// for. The clauses of a gate are Tseitin's ("On the Complexity of Derivation in Propositional
// Calculus", 1968), in both directions.
#ifndef BOOLEQ_DECIDE_ENCODER_H
#define BOOLEQ_DECIDE_ENCODER_H

#include <cstdint>
#include <vector>

#include "gate_graph.h"
#include "solver.h"

namespace booleq {

class Encoder {
  public:
    // Both outlive the encoder; the graph may grow.
    Encoder(const GateGraph& graph, Solver& solver) : m_graph(graph), m_solver(solver) {}

    // The solver's literal for an edge. Requires: the edge is not the constant.
    // Cost: O(gates that it depends on and that no earlier edge depended on).
    int LiteralOf(Edge edge);
    // The variable of an input; 0 if nothing has depended on it so far.
    int VariableOf(uint32_t gate) const
    {
        return gate < m_variables.size() ? m_variables[gate] : 0;
    }
    int NumVariables() const { return m_num_variables; }

  private:
    int VariableAt(uint32_t gate);
    int Signed(Edge edge);
    void AddClauses(uint32_t gate);

    const GateGraph& m_graph;
    Solver& m_solver;
    std::vector<int> m_variables; // by gate; 0: none yet
    std::vector<uint32_t> m_pending;
    int m_num_variables = 0;
};

} // namespace booleq

#endif
