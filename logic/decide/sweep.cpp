#include "sweep.h"

#include <algorithm>
#include <cassert>

#include "cone.h"
#include "patterns.h"

namespace booleq {

namespace {

constexpr size_t kManyGates = 100000;
constexpr size_t kWords = 32;
constexpr size_t kWordsOfMany = 8;
constexpr int kMaxVariables = 2000;              // of the solver before it starts again
constexpr size_t kMaxTries = 8;                  // number of gates that one is compared with
constexpr uint64_t kMaxWork = uint64_t(1) << 31; // about two seconds
constexpr size_t kWatchedGates = 256;

} // namespace

Sweep::Sweep(const GateGraph& graph, Edge root, int maxConflicts, const Deadline& deadline)
    : m_graph(graph.NumInputs()), m_deadline(deadline), m_max_conflicts(maxConflicts), m_random(1),
      m_is_asking(Solver::IsThere())
{
    const Cone cone(graph, root);
    m_num_words = cone.Gates().size() < kManyGates ? kWords : kWordsOfMany;
    m_next_learnt = m_num_words / 2;
    m_values.resize(m_graph.NumGates() * m_num_words);
    Patterns patterns(graph, cone, root);
    std::vector<uint64_t> inputs(cone.Inputs().size());
    for (size_t word = 0; word < m_num_words; ++word) {
        if (word < m_num_words / 4)
            patterns.FillAtRandom(inputs);
        else
            patterns.FillAimed(word % 4 == 0, inputs);
        for (size_t place = 0; place < inputs.size(); ++place)
            WordsOf(cone.Inputs()[place] + 1)[word] = inputs[place];
    }
    m_next.resize(m_graph.NumGates());
    for (uint32_t gate = 0; gate < m_graph.NumGates(); ++gate)
        m_merged.push_back(OutputOf(gate));
    for (const uint32_t input : cone.Inputs()) {
        uint32_t& first = m_first[SignatureOf(input + 1)];
        m_next[input + 1] = first;
        first = input + 1;
    }

    std::vector<Edge> edges(GateOf(root) + 1); // in the new graph
    for (uint32_t input = 0; input < graph.NumInputs() && input + 1 < edges.size(); ++input)
        edges[input + 1] = m_graph.Input(input);
    const auto edgeOf = [&edges](Edge old) {
        return InvertedIf(edges[GateOf(old)], IsInverted(old));
    };
    size_t numGates = 0;
    for (const uint32_t gate : cone.Gates()) {
        if (numGates++ % kWatchedGates == 0 && (m_deadline.IsOver() || m_work > kMaxWork))
            m_is_asking = false;
        const Gate& parts = graph.At(gate);
        const Edge left = edgeOf(parts.left);
        const Edge right = edgeOf(parts.right);
        const Edge edge =
            parts.kind == GateKind::And ? m_graph.And(left, right) : m_graph.Xor(left, right);
        const bool isNew = GateOf(edge) >= m_merged.size();
        SimulateNew();
        if (isNew && m_is_asking)
            m_merged[GateOf(edge)] = Merge(GateOf(edge));
        edges[gate] = InvertedIf(m_merged[GateOf(edge)], IsInverted(edge));
    }
    m_root = edgeOf(root);
    FindWitness();
}

void Sweep::Simulate(uint32_t gate, size_t firstWord, size_t lastWord)
{
    const Gate& parts = m_graph.At(gate);
    const uint64_t* const left = WordsOf(GateOf(parts.left));
    const uint64_t* const right = WordsOf(GateOf(parts.right));
    const uint64_t invertsLeft = IsInverted(parts.left) ? ~uint64_t(0) : 0;
    const uint64_t invertsRight = IsInverted(parts.right) ? ~uint64_t(0) : 0;
    uint64_t* const values = WordsOf(gate);
    for (size_t word = firstWord; word < lastWord; ++word) {
        const uint64_t first = left[word] ^ invertsLeft;
        const uint64_t second = right[word] ^ invertsRight;
        values[word] = parts.kind == GateKind::And ? first & second : first ^ second;
    }
}

void Sweep::SimulateNew()
{
    while (m_merged.size() < m_graph.NumGates()) {
        const auto gate = static_cast<uint32_t>(m_merged.size());
        m_merged.push_back(OutputOf(gate));
        m_next.push_back(0);
        m_values.resize(m_values.size() + m_num_words);
        Simulate(gate, 0, m_num_words);
    }
}

// The same for a gate and its inverse. Only the values that stay are used.
uint64_t Sweep::SignatureOf(uint32_t gate)
{
    const uint64_t* const words = WordsOf(gate);
    const uint64_t inverts = IsComplemented(gate) ? ~uint64_t(0) : 0;
    uint64_t signature = 0;
    for (size_t word = 0; word < m_num_words / 2; ++word) {
        signature ^= words[word] ^ inverts;
        signature *= 0x9e3779b97f4a7c15;
        signature ^= signature >> 29;
    }
    return signature;
}

bool Sweep::MayBeOne(uint32_t gate, uint32_t other)
{
    const bool isInverse = IsComplemented(gate) != IsComplemented(other);
    const uint64_t inverts = isInverse ? ~uint64_t(0) : 0;
    return std::equal(
        WordsOf(gate), WordsOf(gate) + m_num_words, WordsOf(other),
        [inverts](uint64_t left, uint64_t right) { return left == (right ^ inverts); });
}

// The edge for a new gate: an older one's, or its own; then later gates can turn out to be this
// one.
Edge Sweep::Merge(uint32_t gate)
{
    size_t numTries = 0;
    const uint64_t signature = SignatureOf(gate);
    if (MayBeOne(gate, 0)) { // the constant is in no list, because 0 ends them
        ++numTries;
        const Edge constant = InvertedIf(kFalseEdge, IsComplemented(gate));
        if (AskWhetherTheyDiffer(OutputOf(gate), constant) == Solver::Answer::Unsatisfiable)
            return constant;
    }
    const auto found = m_first.find(signature);
    uint32_t other = found == m_first.end() ? 0 : found->second;
    for (; other != 0 && numTries < kMaxTries; other = m_next[other]) {
        if (!MayBeOne(gate, other))
            continue;
        ++numTries;
        const Edge edge =
            InvertedIf(OutputOf(other), IsComplemented(gate) != IsComplemented(other));
        if (AskWhetherTheyDiffer(OutputOf(gate), edge) == Solver::Answer::Unsatisfiable)
            return edge;
    }
    uint32_t& first = m_first[signature];
    m_next[gate] = first;
    first = gate;
    return OutputOf(gate);
}

// If they differ for an assignment, it is learnt.
Solver::Answer Sweep::AskWhetherTheyDiffer(Edge edge, Edge other)
{
    if (m_deadline.IsOver())
        m_is_asking = false;
    if (!m_is_asking)
        return Solver::Answer::Unknown;
    if (!m_encoder || m_encoder->NumVariables() > kMaxVariables) {
        m_encoder.reset();
        m_solver.reset(new Solver(Solver::Effort::Quick, m_deadline));
        m_encoder.reset(new Encoder(m_graph, *m_solver));
    }
    const int literal = m_encoder->LiteralOf(edge);
    Solver::Answer answer = Solver::Answer::Unknown;
    if (GateOf(other) == 0) {
        answer = m_solver->Solve({IsInverted(other) ? -literal : literal}, m_max_conflicts);
    } else {
        const int otherLiteral = m_encoder->LiteralOf(other);
        answer = m_solver->Solve({literal, -otherLiteral}, m_max_conflicts);
        if (answer == Solver::Answer::Unsatisfiable)
            answer = m_solver->Solve({-literal, otherLiteral}, m_max_conflicts);
    }
    if (answer == Solver::Answer::Satisfiable)
        LearnFromModel();
    return answer;
}

// The solver's assignment and 63 neighbours replace the oldest learnt word.
void Sweep::LearnFromModel()
{
    const size_t word = m_next_learnt++;
    if (m_next_learnt == m_num_words)
        m_next_learnt = m_num_words / 2;
    for (uint32_t gate = 1; gate <= m_graph.NumInputs(); ++gate) {
        uint64_t& values = WordsOf(gate)[word];
        const int variable = m_encoder->VariableOf(gate);
        if (variable == 0)
            continue;
        const uint64_t changes = m_random() & m_random() & m_random() & ~uint64_t(1);
        values = (m_solver->Value(variable) ? ~uint64_t(0) : 0) ^ changes;
    }
    for (uint32_t gate = m_graph.NumInputs() + 1; gate < m_graph.NumGates(); ++gate)
        Simulate(gate, word, word + 1);
    m_work += m_graph.NumGates();
}

void Sweep::FindWitness()
{
    const uint64_t* const words = WordsOf(GateOf(m_root));
    const uint64_t inverts = IsInverted(m_root) ? ~uint64_t(0) : 0;
    for (size_t word = 0; word < m_num_words; ++word) {
        const uint64_t ones = words[word] ^ inverts;
        if (ones == 0)
            continue;
        const auto bit = static_cast<unsigned int>(__builtin_ctzll(ones));
        for (uint32_t input = 0; input < m_graph.NumInputs(); ++input)
            m_witness.push_back((WordsOf(input + 1)[word] >> bit & 1u) != 0);
        return;
    }
    assert(m_root != kTrueEdge);
}

} // namespace booleq
