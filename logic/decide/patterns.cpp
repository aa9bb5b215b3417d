#include "patterns.h"

#include <algorithm>
#include <cassert>

namespace booleq {

Patterns::Patterns(const GateGraph& graph, const Cone& cone, Edge root)
    : m_graph(graph), m_cone(cone), m_root(root), m_random(1)
{
}

// In some words the inputs are mostly 0 or mostly 1.
void Patterns::FillAtRandom(std::vector<uint64_t>& inputs)
{
    assert(inputs.size() == m_cone.Inputs().size());
    const uint64_t kind = m_random() % 4;
    for (uint64_t& values : inputs) {
        values = m_random();
        if (kind < 2)
            continue;
        values &= m_random();
        if (kind == 3)
            values &= m_random();
        if (m_random() % 2 == 0)
            values = ~values;
    }
}

void Patterns::Want(Edge edge, const Wish& wish)
{
    Wish& own = m_wishes[GateOf(edge)];
    own.one |= IsInverted(edge) ? wish.zero : wish.one;
    own.zero |= IsInverted(edge) ? wish.one : wish.zero;
}

void Patterns::FillAimed(bool aimsAtRoot, std::vector<uint64_t>& inputs)
{
    assert(inputs.size() == m_cone.Inputs().size());
    const std::vector<uint32_t>& gates = m_cone.Gates();
    m_wishes.assign(GateOf(m_root) + 1, {0, 0});
    if (aimsAtRoot)
        Want(m_root, {~uint64_t(0), 0});
    for (uint64_t bit = 0; !aimsAtRoot && bit < 64 && !gates.empty(); ++bit) {
        const auto place = static_cast<size_t>(m_random() % gates.size());
        Wish& wish = m_wishes[gates[place]];
        (m_random() % 2 == 0 ? wish.one : wish.zero) |= uint64_t(1) << bit;
    }
    for (size_t place = gates.size(); place-- > 0;) {
        const Gate& gate = m_graph.At(gates[place]);
        const Wish wish = m_wishes[gates[place]];
        if ((wish.one | wish.zero) == 0)
            continue;
        const uint64_t choice = m_random();
        if (gate.kind == GateKind::And) {
            Want(gate.left, {wish.one, wish.zero & choice});
            Want(gate.right, {wish.one, wish.zero & ~choice});
            continue;
        }
        assert(gate.kind == GateKind::Xor);
        const uint64_t wanted = wish.one | wish.zero;
        const uint64_t right = choice ^ wish.one;
        Want(gate.left, {choice & wanted, ~choice & wanted});
        Want(gate.right, {right & wanted, ~right & wanted});
    }
    for (size_t place = 0; place < inputs.size(); ++place) {
        const Wish& wish = m_wishes[GateOf(m_graph.Input(m_cone.Inputs()[place]))];
        const uint64_t isFree = ~(wish.one ^ wish.zero); // also if both are wanted
        inputs[place] = (wish.one & ~isFree) | (m_random() & isFree);
    }
}

} // namespace booleq
