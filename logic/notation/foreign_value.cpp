// What a tree of another notation means: with operators on bits if that is exact, otherwise by
// computing with values as wide as the notation makes them.
#include "foreign_tree.h"

#include <algorithm>
#include <cassert>
#include <memory>

#include "flatten.h"
#include "watch.h"

namespace booleq {

namespace {

bool IsNot(Meaning meaning)
{
    return meaning == Meaning::BitNot || meaning == Meaning::LogicalNot;
}

bool IsLeaf(Meaning meaning)
{
    return meaning <= Meaning::Input;
}

// Whether node k's own operands make it 32 bits wide, because one of them is a number; otherwise it
// is one bit wide. An inversion to a truth value is always one bit.
std::vector<bool> FindWide(const ForeignTree& tree)
{
    std::vector<bool> isWide(tree.nodes.size());
    for (size_t node = 0; node < tree.nodes.size(); ++node) {
        const ForeignTree::Node& own = tree.nodes[node];
        if (IsLeaf(own.meaning))
            isWide[node] = own.meaning == Meaning::WideZero || own.meaning == Meaning::WideOne;
        else if (own.meaning == Meaning::BitNot)
            isWide[node] = isWide[own.left];
        else if (own.meaning != Meaning::LogicalNot)
            isWide[node] = isWide[own.left] || isWide[own.right];
    }
    return isWide;
}

// In vectors the lowest bit of a result depends only on the lowest bits of the operands, except for
// an inversion to a truth value, which depends on all bits.
bool IsExactInBits(const ForeignTree& tree)
{
    if (tree.notation->values == Values::Bits)
        return true;
    const std::vector<bool> isWide = FindWide(tree);
    return std::all_of(tree.nodes.begin(), tree.nodes.end(), [&](const ForeignTree::Node& node) {
        if (tree.notation->values == Values::Vector)
            return node.meaning != Meaning::LogicalNot || !isWide[node.left] ||
                   IsLeaf(tree.nodes[node.left].meaning);
        return node.meaning != Meaning::BitNot && node.meaning != Meaning::Add;
    });
}

Operator OperatorOf(Meaning meaning)
{
    switch (meaning) {
    case Meaning::Zero:
    case Meaning::WideZero:
    case Meaning::Foreign:
        break;
    case Meaning::One:
    case Meaning::WideOne:
        return Operator::One;
    case Meaning::Input:
        return Operator::Input;
    case Meaning::BitNot:
    case Meaning::LogicalNot:
        return Operator::Not;
    case Meaning::And:
    case Meaning::Multiply:
        return Operator::And;
    case Meaning::Or:
        return Operator::Or;
    case Meaning::Xor:
    case Meaning::Add:
        return Operator::Xor;
    case Meaning::Nand:
        return Operator::Nand;
    case Meaning::Nor:
        return Operator::Nor;
    case Meaning::Nxor:
        return Operator::Nxor;
    }
    return Operator::Zero;
}

constexpr uint64_t kBitMask = 1;
constexpr uint64_t kNumberMask = 0xffffffff;
constexpr uint64_t kIntMask = ~uint64_t(0);

// A mask of the bits of each node's value. In vectors an operator works in the width of its
// context, which the root or the nearest truth value above sets.
std::vector<uint64_t> MasksOf(const ForeignTree& tree)
{
    if (tree.notation->values != Values::Vector)
        return std::vector<uint64_t>(tree.nodes.size(), kIntMask);
    const std::vector<bool> isWide = FindWide(tree);
    const auto maskOf = [](bool wide) { return wide ? kNumberMask : kBitMask; };
    assert(!tree.nodes.empty());
    std::vector<uint64_t> masks(tree.nodes.size());
    masks.back() = maskOf(isWide.back());
    for (size_t node = masks.size(); node-- > 0;) {
        const ForeignTree::Node& own = tree.nodes[node];
        if (IsLeaf(own.meaning))
            continue;
        const bool isOwnContext = own.meaning == Meaning::LogicalNot;
        masks[own.left] = isOwnContext ? maskOf(isWide[own.left]) : masks[node];
        if (!IsNot(own.meaning))
            masks[own.right] = masks[node];
    }
    return masks;
}

// Computes with the values of one assignment in their full width. Sums and products of bits stay
// far below 64 bits in any text that people write; larger ones wrap.
class ValueMachine {
  public:
    explicit ValueMachine(const ForeignTree& tree)
        : m_tree(tree), m_masks(MasksOf(tree)), m_values(tree.nodes.size())
    {
    }

    bool Run(const std::vector<uint64_t>& inputs, unsigned int lane)
    {
        for (size_t node = 0; node < m_values.size(); ++node)
            m_values[node] = Value(m_tree.nodes[node], inputs, lane) & m_masks[node];
        const uint64_t result = m_values.back();
        return m_tree.notation->values == Values::Int ? result != 0 : (result & 1u) != 0;
    }

  private:
    uint64_t Value(const ForeignTree::Node& node, const std::vector<uint64_t>& inputs,
                   unsigned int lane) const
    {
        const auto operands = [this, &node] {
            return std::make_pair(m_values[node.left], m_values[node.right]);
        };
        switch (node.meaning) {
        case Meaning::Zero:
        case Meaning::WideZero:
        case Meaning::Foreign:
            break;
        case Meaning::One:
        case Meaning::WideOne:
            return 1;
        case Meaning::Input:
            return inputs[node.left] >> lane & 1u;
        case Meaning::BitNot:
            return ~m_values[node.left];
        case Meaning::LogicalNot:
            return m_values[node.left] == 0 ? 1 : 0;
        case Meaning::And:
            return operands().first & operands().second;
        case Meaning::Or:
            return operands().first | operands().second;
        case Meaning::Xor:
            return operands().first ^ operands().second;
        case Meaning::Nand:
            return ~(operands().first & operands().second);
        case Meaning::Nor:
            return ~(operands().first | operands().second);
        case Meaning::Nxor:
            return ~(operands().first ^ operands().second);
        case Meaning::Add:
            return operands().first + operands().second;
        case Meaning::Multiply:
            return operands().first * operands().second;
        }
        return 0;
    }

    const ForeignTree& m_tree;
    std::vector<uint64_t> m_masks;
    std::vector<uint64_t> m_values;
};

// Values as gates, one edge for each bit that a value has; bit 0 first.
class GateMachine {
  public:
    GateMachine(const ForeignTree& tree, const std::vector<Edge>& inputs, GateGraph& graph)
        : m_tree(tree), m_inputs(inputs), m_graph(graph), m_masks(MasksOf(tree))
    {
    }

    Edge Run()
    {
        std::vector<Bus> values; // of operands that wait for their operator
        for (size_t index = 0; index < m_tree.nodes.size(); ++index) {
            Watch();
            const ForeignTree::Node& node = m_tree.nodes[index];
            const size_t width = WidthOf(m_masks[index]);
            Bus value;
            if (!IsLeaf(node.meaning)) {
                value = values.back();
                values.pop_back();
            }
            if (IsLeaf(node.meaning)) {
                value = {LeafOf(node)};
            } else if (node.meaning == Meaning::LogicalNot) {
                value = {Inverse(IsAny(value))};
            } else if (node.meaning != Meaning::BitNot) {
                value = Binary(node.meaning, values.back(), value);
                values.pop_back();
            }
            assert(value.size() <= width);
            value.resize(width, kFalseEdge);
            if (node.meaning == Meaning::BitNot || IsNegatedBinary(node.meaning))
                for (Edge& bit : value)
                    bit = Inverse(bit);
            values.push_back(std::move(value));
        }
        assert(values.size() == 1);
        return m_tree.notation->values == Values::Int ? IsAny(values.back()) : values.back()[0];
    }

  private:
    typedef std::vector<Edge> Bus;

    static size_t WidthOf(uint64_t mask)
    {
        return mask == kBitMask ? 1 : mask == kNumberMask ? 32 : 64;
    }

    static bool IsNegatedBinary(Meaning meaning)
    {
        return meaning == Meaning::Nand || meaning == Meaning::Nor || meaning == Meaning::Nxor;
    }

    Edge LeafOf(const ForeignTree::Node& node) const
    {
        if (node.meaning == Meaning::Input)
            return m_inputs[node.left];
        return node.meaning == Meaning::One || node.meaning == Meaning::WideOne ? kTrueEdge
                                                                                : kFalseEdge;
    }

    Edge IsAny(Bus bits) // a copy: it is sorted
    {
        for (Edge& bit : bits)
            bit = Inverse(bit);
        return Inverse(m_graph.AndOfAll(bits.data(), bits.data() + bits.size()));
    }

    // The result before the inversion that some operators end with. Requires: both have the same
    // width.
    Bus Binary(Meaning meaning, const Bus& left, const Bus& right)
    {
        assert(left.size() == right.size());
        if (meaning == Meaning::Add)
            return Sum(left, right);
        if (meaning == Meaning::Multiply)
            return Product(left, right);
        Bus result;
        for (size_t bit = 0; bit < left.size(); ++bit) {
            if (meaning == Meaning::And || meaning == Meaning::Nand)
                result.push_back(m_graph.And(left[bit], right[bit]));
            else if (meaning == Meaning::Or || meaning == Meaning::Nor)
                result.push_back(m_graph.Or(left[bit], right[bit]));
            else
                result.push_back(m_graph.Xor(left[bit], right[bit]));
        }
        return result;
    }

    Bus Sum(const Bus& left, const Bus& right)
    {
        Bus result;
        Edge carry = kFalseEdge;
        for (size_t bit = 0; bit < left.size(); ++bit) {
            const Edge half = m_graph.Xor(left[bit], right[bit]);
            result.push_back(m_graph.Xor(half, carry));
            carry = m_graph.Or(m_graph.And(left[bit], right[bit]), m_graph.And(half, carry));
        }
        return result;
    }

    Bus Product(const Bus& left, const Bus& right)
    {
        Bus result(left.size(), kFalseEdge);
        for (size_t shift = 0; shift < right.size(); ++shift) {
            Bus addend(left.size(), kFalseEdge);
            for (size_t bit = shift; bit < left.size(); ++bit)
                addend[bit] = m_graph.And(left[bit - shift], right[shift]);
            result = Sum(result, addend);
        }
        return result;
    }

    const ForeignTree& m_tree;
    const std::vector<Edge>& m_inputs;
    GateGraph& m_graph;
    std::vector<uint64_t> m_masks;
};

} // namespace

bool ToExpression(const ForeignTree& tree, Expression& expression)
{
    if (!IsExactInBits(tree))
        return false;
    expression.nodes.clear();
    expression.names = tree.names;
    for (const ForeignTree::Node& node : tree.nodes)
        expression.nodes.push_back({OperatorOf(node.meaning), 0, node.left, node.right});
    assert(!expression.nodes.empty());
    return true;
}

WordFunction ToWordFunction(const ForeignTree& tree)
{
    Expression expression;
    if (ToExpression(tree, expression)) {
        auto stack = std::make_shared<std::vector<uint64_t>>();
        return [expression, stack](const std::vector<uint64_t>& inputs) {
            return EvaluateWord(expression, inputs, *stack);
        };
    }
    auto machine = std::make_shared<ValueMachine>(tree);
    return [machine](const std::vector<uint64_t>& inputs) {
        uint64_t word = 0;
        for (unsigned int lane = 0; lane < 64; ++lane)
            word |= uint64_t(machine->Run(inputs, lane) ? 1 : 0) << lane;
        return word;
    };
}

Side SideOf(const ForeignTree& tree)
{
    const auto build = [&tree](const std::vector<Edge>& inputs, GateGraph& graph) {
        Expression expression;
        if (ToExpression(tree, expression))
            return AddExpression(expression, inputs, graph);
        return GateMachine(tree, inputs, graph).Run();
    };
    return {tree.names, build, ToWordFunction(tree)};
}

} // namespace booleq
