// Assignments that tell gates apart, 64 at a time: random ones, and some that make chosen gates
// likely to be 1 or 0. With even chances a gate of many operands would hardly ever change its
// value. Values are justified backwards from a gate as in test generation (Goel, "An Implicit
// Enumeration Algorithm to Generate Tests for Combinational Logic Circuits", IEEE TC C-30(3),
// 1981), but without backtracking.
#ifndef BOOLEQ_DECIDE_PATTERNS_H
#define BOOLEQ_DECIDE_PATTERNS_H

#include <cstdint>
#include <random>
#include <vector>

#include "cone.h"
#include "gate_graph.h"

namespace booleq {

// The same calls always give the same values.
class Patterns {
  public:
    // Both outlive the patterns; the cone belongs to the graph.
    Patterns(const GateGraph& graph, const Cone& cone, Edge root);

    // Fills in values of the cone's inputs.  Requires: as many elements.  Cost: O(inputs).
    void FillAtRandom(std::vector<uint64_t>& inputs);
    // Aims at making the root 1 if 'aimsAtRoot', otherwise at random values of other gates in the
    // cone.
    // Cost: O(gates of the cone).
    void FillAimed(bool aimsAtRoot, std::vector<uint64_t>& inputs);

  private:
    // The values wanted of a gate, one assignment in each bit; both are set for a contradiction.
    struct Wish {
        uint64_t one;
        uint64_t zero;
    };
    void Want(Edge edge, const Wish& wish);

    const GateGraph& m_graph;
    const Cone& m_cone;
    Edge m_root;
    std::mt19937_64 m_random;
    std::vector<Wish> m_wishes; // by gate
};

} // namespace booleq

#endif
