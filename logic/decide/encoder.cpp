#include "encoder.h"

#include <cassert>

#include "watch.h"

namespace booleq {

namespace {

constexpr size_t kWatchedGates = 4096;

} // namespace

int Encoder::VariableAt(uint32_t gate)
{
    assert(gate != 0);
    if (m_variables[gate] == 0) {
        m_variables[gate] = ++m_num_variables;
        m_pending.push_back(gate);
    }
    return m_variables[gate];
}

int Encoder::Signed(Edge edge)
{
    const int variable = VariableAt(GateOf(edge));
    return IsInverted(edge) ? -variable : variable;
}

void Encoder::AddClauses(uint32_t gate)
{
    const Gate parts = m_graph.At(gate);
    if (parts.kind == GateKind::Input)
        return;
    const int output = m_variables[gate];
    const int left = Signed(parts.left);
    const int right = Signed(parts.right);
    if (parts.kind == GateKind::And) {
        m_solver.Add({-output, left});
        m_solver.Add({-output, right});
        m_solver.Add({output, -left, -right});
        return;
    }
    assert(parts.kind == GateKind::Xor);
    m_solver.Add({-output, left, right});
    m_solver.Add({-output, -left, -right});
    m_solver.Add({output, -left, right});
    m_solver.Add({output, left, -right});
}

int Encoder::LiteralOf(Edge edge)
{
    m_variables.resize(m_graph.NumGates());
    const int literal = Signed(edge);
    for (size_t numGates = 0; !m_pending.empty(); ++numGates) {
        if (numGates % kWatchedGates == kWatchedGates - 1)
            Watch();
        const uint32_t gate = m_pending.back();
        m_pending.pop_back();
        AddClauses(gate);
    }
    return literal;
}

} // namespace booleq
