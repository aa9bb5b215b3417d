// Gates that are one function, or inverse ones, become one gate. A graph and an edge of it enter, a
// smaller graph and edge leave. Which gates may be one is seen from their values for random
// assignments; a solver proves it, or gives an assignment that tells more gates apart.
// Mishchenko, Chatterjee, Jiang, Brayton, "FRAIGs: A Unifying Representation for Logic Synthesis
// and Verification", ERL Technical Report, UC Berkeley, 2005.
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
    // 'maxConflicts' bounds each question to the solver. Ends early, with gates left alone, when
    // out of time. The deadline outlives the sweep; the graph may go. Fails: std::bad_alloc,
    // or what the watcher throws.
    Sweep(const GateGraph& graph, Edge root, int maxConflicts, const Deadline& deadline);

    // Over the same inputs. The root is as the one that entered.
    const GateGraph& Graph() const { return m_graph; }
    Edge Root() const { return m_root; }
    // Some assignment met on the way makes the root 1. Its values, by input; empty when none does.
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

    // Values: m_num_words for each gate, the first half random, the others from the solver.
    size_t m_num_words;
    size_t m_next_learnt;
    std::vector<uint64_t> m_values;
    std::unordered_map<uint64_t, uint32_t> m_first; // gates by signature; 0 ends a list
    std::vector<uint32_t> m_next;
    std::vector<Edge> m_merged; // what a gate was found to be

    std::unique_ptr<Solver> m_solver;
    std::unique_ptr<Encoder> m_encoder;
    bool m_is_asking;    // until a limit is reached
    uint64_t m_work = 0; // values computed again
};

} // namespace booleq

#endif
