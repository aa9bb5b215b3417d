#include "cone.h"

#include <algorithm>
#include <cassert>

namespace booleq {

Cone::Cone(const GateGraph& graph, Edge root)
{
    std::vector<uint32_t> places(GateOf(root) + 1); // 0: not in the cone
    places[GateOf(root)] = 1;
    for (uint32_t gate = GateOf(root); gate > graph.NumInputs(); --gate) {
        if (places[gate] == 0)
            continue;
        m_gates.push_back(gate);
        places[GateOf(graph.At(gate).left)] = 1;
        places[GateOf(graph.At(gate).right)] = 1;
    }
    std::reverse(m_gates.begin(), m_gates.end());

    places[0] = 0;
    uint32_t numPlaces = 1;
    for (uint32_t gate = 1; gate <= graph.NumInputs() && gate < places.size(); ++gate) {
        if (places[gate] == 0)
            continue;
        m_inputs.push_back(gate - 1);
        places[gate] = numPlaces++;
    }
    const auto placed = [&places](Edge edge) {
        return InvertedIf(OutputOf(places[GateOf(edge)]), IsInverted(edge));
    };
    m_steps.reserve(m_gates.size());
    for (const uint32_t gate : m_gates) {
        const Gate& parts = graph.At(gate);
        assert(GateOf(parts.left) < gate && GateOf(parts.right) < gate);
        m_steps.push_back({parts.kind == GateKind::Xor, placed(parts.left), placed(parts.right)});
        places[gate] = numPlaces++;
    }
    m_root = placed(root);
    m_values.resize(numPlaces);
    assert(numPlaces == 1 + m_inputs.size() + m_gates.size());
}

uint64_t Cone::Evaluate(const std::vector<uint64_t>& inputs)
{
    assert(inputs.size() == m_inputs.size());
    size_t place = 1;
    for (const uint64_t value : inputs)
        m_values[place++] = value;
    for (const Step& step : m_steps) {
        const uint64_t left = ValueOf(step.left);
        const uint64_t right = ValueOf(step.right);
        m_values[place++] = step.isXor ? left ^ right : left & right;
    }
    return ValueOf(m_root);
}

} // namespace booleq
