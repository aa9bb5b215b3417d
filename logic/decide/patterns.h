// Assignments to tell gates apart, 64 at a time: at random, and so that chosen gates are likely to
// be 1 or 0. By even chances a gate of many operands would hardly ever change its value. Values are
// justified backwards from a gate as in test generation: Goel, "An Implicit Enumeration Algorithm
// to Generate Tests for Combinational Logic Circuits", IEEE TC C-30(3), 1981, but without going
// back.
#ifndef BOOLEQ_DECIDE_PATTERNS_H
#define BOOLEQ_DECIDE_PATTERNS_H

#include <cstdint>
#include <random>
#include <vector>

#include "cone.h"
#include "gate_graph.h"

namespace booleq {

// The same calls give the same values.
class Patterns {
  public:
    // Both outlive the patterns; the cone is one of the graph's.
    Patterns(const GateGraph& graph, const Cone& cone, Edge root);

    // Values of the cone's inputs, as many.  Cost: O(inputs).
    void FillAtRandom(std::vector<uint64_t>& inputs);
    // Aimed at the root being 1, when 'aimsAtRoot', and at other gates in the cone.
    // Cost: O(gates of the cone).
    void FillAimed(bool aimsAtRoot, std::vector<uint64_t>& inputs);

  private:
    // What gates are wanted to be, one assignment in each bit; both for a contradiction.
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
