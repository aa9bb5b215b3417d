// Folding by what two gates together show: Brummayer, Biere, "Local Two-Level And-Inverter Graph
// Minimization without Blowup", MEMICS 2006.
#include "gate_graph.h"

#include <algorithm>
#include <cassert>

namespace booleq {

namespace {

constexpr size_t kFirstSlots = 64;

uint64_t Mixed(uint64_t value)
{
    value ^= value >> 31;
    value *= 0x9e3779b97f4a7c15;
    return value ^ (value >> 29);
}

bool Has(const Gate& gate, Edge operand)
{
    return gate.left == operand || gate.right == operand;
}

Edge OtherOperand(const Gate& gate, Edge operand)
{
    assert(Has(gate, operand));
    return gate.left == operand ? gate.right : gate.left;
}

} // namespace

GateGraph::GateGraph(uint32_t numInputs) : m_num_inputs(numInputs), m_slots(kFirstSlots)
{
    m_gates.push_back({GateKind::Constant, 0, 0});
    for (uint32_t input = 0; input < numInputs; ++input)
        m_gates.push_back({GateKind::Input, input, 0});
}

// The slot of the gate, or the empty slot where it belongs.
Edge* GateGraph::Slot(GateKind kind, Edge left, Edge right)
{
    const size_t mask = m_slots.size() - 1;
    const uint64_t key = uint64_t(left) << 32 | right;
    size_t slot = static_cast<size_t>(Mixed(key + (kind == GateKind::Xor ? 1 : 0))) & mask;
    while (m_slots[slot] != 0) { // this ends: half of the slots are empty
        const Gate& gate = m_gates[GateOf(m_slots[slot])];
        if (gate.left == left && gate.right == right && gate.kind == kind)
            break;
        slot = (slot + 1) & mask;
    }
    return &m_slots[slot];
}

Edge GateGraph::Find(GateKind kind, Edge left, Edge right)
{
    return *Slot(kind, std::min(left, right), std::max(left, right));
}

void GateGraph::Grow()
{
    m_slots.assign(2 * m_slots.size(), 0);
    for (uint32_t gate = m_num_inputs + 1; gate < NumGates(); ++gate)
        *Slot(m_gates[gate].kind, m_gates[gate].left, m_gates[gate].right) = OutputOf(gate);
}

Edge GateGraph::FindOrAdd(GateKind kind, Edge left, Edge right)
{
    assert(left < right && GateOf(left) != GateOf(right) && GateOf(left) != 0); // invariant 2
    assert(kind == GateKind::And || (!IsInverted(left) && !IsInverted(right)));
    assert(GateOf(right) < NumGates()); // invariant 1
    Edge* slot = Slot(kind, left, right);
    if (*slot != 0)
        return *slot;
    assert(m_gates.size() < uint32_t(1) << 31);
    const Edge output = OutputOf(NumGates());
    *slot = output;
    m_gates.push_back({kind, left, right});
    if (2 * m_gates.size() > m_slots.size())
        Grow();
    return output;
}

// Uses 'side' to simplify 'other', a gate that has it or its inverse as an operand. True if that
// gave something: the result, or another pair of operands.
bool GateGraph::FoldInto(Edge side, Edge& other, Folding& folding) const
{
    const Gate& gate = m_gates[GateOf(other)];
    if (gate.kind == GateKind::And && !IsInverted(other)) {
        if (Has(gate, side))
            folding = {true, other}; // a & (a & b)
        else if (Has(gate, Inverse(side)))
            folding = {true, kFalseEdge};
        else
            return false;
        return true;
    }
    if (gate.kind == GateKind::And) {
        if (Has(gate, Inverse(side))) // a & ~(~a & b)
            folding = {true, side};
        else if (Has(gate, side)) // a & ~(a & b) is a & ~b
            other = Inverse(OtherOperand(gate, side));
        else
            return false;
        return true;
    }
    if (gate.kind == GateKind::Xor && Has(gate, OutputOf(GateOf(side)))) {
        const Edge rest = OtherOperand(gate, OutputOf(GateOf(side))); // a & (a ^ b) is a & ~b
        other = InvertedIf(rest, IsInverted(side) == IsInverted(other));
        return true;
    }
    return false;
}

// The same for two gates that share operands.
bool GateGraph::FoldGates(Edge left, Edge& right, Folding& folding) const
{
    const Gate& gate = m_gates[GateOf(left)];
    const Gate& other = m_gates[GateOf(right)];
    if (gate.kind != GateKind::And || other.kind == GateKind::Input)
        return false;
    if (!IsInverted(left)) { // what holds for an operand holds for the AND
        for (Edge side : {gate.left, gate.right}) {
            Edge rest = right;
            Folding inner = {false, 0};
            if (!FoldInto(side, rest, inner))
                continue;
            if (!inner.isResult)
                right = rest;
            else if (inner.result == kFalseEdge)
                folding = inner; // (a & b) & (~a & c)
            else if (inner.result == side)
                folding = {true, left}; // (a & b) & ~(~a & c)
            else
                continue; // (a & b) & (a & c)
            return true;
        }
        return false;
    }
    if (other.kind != GateKind::And || !IsInverted(right))
        return false;
    for (const Edge side : {gate.left, gate.right}) {
        if (Has(other, side) && Has(other, Inverse(OtherOperand(gate, side)))) {
            folding = {true, Inverse(side)}; // ~(a & b) & ~(a & ~b)
            return true;
        }
    }
    return false;
}

// One step. True if the pair has changed, or if folding.isResult.
bool GateGraph::FoldPair(Edge& left, Edge& right, Folding& folding) const
{
    if (left > right)
        std::swap(left, right);
    if (left <= kTrueEdge || GateOf(left) == GateOf(right)) {
        const bool isRight = left == kTrueEdge || left == right;
        folding = {true, isRight ? right : kFalseEdge};
        return true;
    }
    return FoldInto(left, right, folding) || FoldInto(right, left, folding) ||
           FoldGates(left, right, folding) || FoldGates(right, left, folding);
}

Edge GateGraph::And(Edge left, Edge right)
{
    Folding folding = {false, 0};
    // This ends: each step without a result replaces an operand by a lower one.
    while (FoldPair(left, right, folding))
        if (folding.isResult)
            return folding.result;
    if (left > right)
        std::swap(left, right);
    const Gate& gate = m_gates[GateOf(left)];
    const Gate& other = m_gates[GateOf(right)];
    if (IsInverted(left) && IsInverted(right) && gate.kind == GateKind::And &&
        other.kind == GateKind::And && Has(other, Inverse(gate.left)) &&
        Has(other, Inverse(gate.right)))
        return XorOfOperands(gate); // ~(a & b) & ~(~a & ~b)
    return FindOrAdd(GateKind::And, left, right);
}

// The exclusive OR of the operands of an AND. No folding of Xor() applies: neither operand is a
// gate that has the other as its operand, or the AND itself would have been folded.
Edge GateGraph::XorOfOperands(const Gate& gate)
{
    assert(gate.kind == GateKind::And);
    const bool isInverted = IsInverted(gate.left) != IsInverted(gate.right);
    const Edge left = OutputOf(GateOf(gate.left));
    const Edge right = OutputOf(GateOf(gate.right));
    [[maybe_unused]] const Gate& upper = m_gates[GateOf(right)];
    assert(upper.kind == GateKind::Input || !Has(upper, left));
    assert(upper.kind != GateKind::And || !Has(upper, Inverse(left)));
    return InvertedIf(FindOrAdd(GateKind::Xor, left, right), isInverted);
}

Edge GateGraph::Xor(Edge left, Edge right)
{
    const bool isInverted = IsInverted(left) != IsInverted(right);
    left = OutputOf(GateOf(left));
    right = OutputOf(GateOf(right));
    if (left > right)
        std::swap(left, right);
    if (left == right || left == kFalseEdge)
        return InvertedIf(left == right ? kFalseEdge : right, isInverted);
    for (const Edge side : {left, right}) {
        const Edge other = side == left ? right : left;
        const Gate& gate = m_gates[GateOf(other)];
        if (gate.kind == GateKind::Xor && Has(gate, side)) // a ^ (a ^ b)
            return InvertedIf(OtherOperand(gate, side), isInverted);
        if (gate.kind != GateKind::And)
            continue;
        if (Has(gate, side)) // a ^ (a & b)
            return InvertedIf(And(side, Inverse(OtherOperand(gate, side))), isInverted);
        if (Has(gate, Inverse(side))) // a ^ (~a & b)
            return InvertedIf(Or(side, OtherOperand(gate, Inverse(side))), isInverted);
    }
    return InvertedIf(FindOrAdd(GateKind::Xor, left, right), isInverted);
}

// Among the sorted operands of an AND, ~(a & b) and ~(~a & ~b) become one exclusive OR.
Edge* GateGraph::JoinExclusive(Edge* first, Edge* last)
{
    bool isChanged = false;
    for (Edge* operand = first; operand != last; ++operand) {
        if (!IsInverted(*operand) || !IsGate(*operand, GateKind::And))
            continue;
        const Gate gate = m_gates[GateOf(*operand)];
        const Edge twin = Find(GateKind::And, Inverse(gate.left), Inverse(gate.right));
        if (twin < *operand) // there is none, or it has found this one already
            continue;
        Edge* const found = std::lower_bound(operand, last, Inverse(twin));
        if (found == last || *found != Inverse(twin))
            continue;
        *operand = XorOfOperands(gate);
        std::copy(found + 1, last, found);
        --last;
        isChanged = true;
    }
    if (isChanged)
        std::sort(first, last);
    return last;
}

Edge GateGraph::AndOfAll(Edge* first, Edge* last)
{
    std::sort(first, last);
    last = JoinExclusive(first, std::unique(first, last));
    for (Edge* operand = first; operand != last; ++operand)
        if (operand + 1 != last && operand[1] == Inverse(*operand))
            return kFalseEdge;
    Edge result = kTrueEdge;
    for (; first != last; ++first)
        result = And(result, *first);
    return result;
}

Edge GateGraph::XorOfAll(Edge* first, Edge* last)
{
    bool isInverted = false;
    for (Edge* operand = first; operand != last; ++operand) {
        isInverted = isInverted != IsInverted(*operand);
        *operand = OutputOf(GateOf(*operand));
    }
    std::sort(first, last);
    Edge result = kFalseEdge;
    while (first != last) {
        if (first + 1 != last && *first == first[1]) {
            first += 2;
            continue;
        }
        result = Xor(result, *first++);
    }
    return InvertedIf(result, isInverted);
}

} // namespace booleq
