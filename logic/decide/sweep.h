// Gates that are the same function, or inverse ones, become one gate. A graph and an edge of it
// enter; a smaller graph and an edge leave. Random assignments show which gates may be the same;
// the solver proves it, or gives an assignment that tells more gates apart. Mishchenko, Chatterjee,
// Jiang, Brayton, "FRAIGs: A Unifying Representation for Logic Synthesis and Verification", ERL
// Technical Report, UC Berkeley, 2005.
#ifndef BOOLEQ_DECIDE_SWEEP_H
#define BOOLEQ_DECIDE_SWEEP_H

#include <cstdint>
#include <memory>
#include <random>
#include <unordered_map>
#include <vector>

#include "deadline.h"
#include "encoder.h"
#include "gate_graph.h"
#include "solver.h"

namespace booleq {

class Sweep {
  public:
    // 'maxConflicts' limits each question to the solver. When the time runs out, the rest of the
    // gates stay as they are. The deadline outlives the sweep; the graph need not.
    // Fails: std::bad_alloc, or what the watcher throws.
    Sweep(const GateGraph& graph, Edge root, int maxConflicts, const Deadline& deadline);

    // The graph has the same inputs. The root is the same function as the one that entered.
    const GateGraph& Graph() const { return m_graph; }
    Edge Root() const { return m_root; }
    // The values, by input, of an assignment met on the way that makes the root 1; empty if none
    // does.
    const std::vector<bool>& Witness() const { return m_witness; }

  private:
    void Simulate(uint32_t gate, size_t firstWord, size_t lastWord);
    void SimulateNew();
    uint64_t* WordsOf(uint32_t gate) { return &m_values[gate * m_num_words]; }
    bool IsComplemented(uint32_t gate) { return (WordsOf(gate)[0] & 1u) != 0; }
    uint64_t SignatureOf(uint32_t gate);
    bool MayBeOne(uint32_t gate, uint32_t other);
    Edge Merge(uint32_t gate);
    Solver::Answer AskWhetherTheyDiffer(Edge edge, Edge other);
    void LearnFromModel();
    void FindWitness();

    GateGraph m_graph;
    Edge m_root = kFalseEdge;
    std::vector<bool> m_witness;
    const Deadline& m_deadline;
    int m_max_conflicts;
    std::mt19937_64 m_random;

    // Values: m_num_words for each gate. The first half stays; the solver's assignments replace the
    // rest.
    size_t m_num_words;
    size_t m_next_learnt;
    std::vector<uint64_t> m_values;
    std::unordered_map<uint64_t, uint32_t> m_first; // the first gate by signature; 0 ends a list
    std::vector<uint32_t> m_next;
    std::vector<Edge> m_merged; // the edge that each gate was found to be

    std::unique_ptr<Solver> m_solver;
    std::unique_ptr<Encoder> m_encoder;
    bool m_is_asking;    // false once a limit is reached
    uint64_t m_work = 0; // number of values computed again
};

} // namespace booleq

#endif
