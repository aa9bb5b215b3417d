// What a tree of another notation says: as operators on bits where that is exact, otherwise by
// computing with values as wide as the notation has them.
#include "foreign_tree.h"

#include <algorithm>
#include <memory>

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

// Node k's width in bits, given by its own operands: 1, or 32 where a number is among them. An
// inversion to a truth value is one bit whatever is inside.
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

// In vectors the lowest bit of a result depends on the lowest bits of operands alone, but for an
// inversion to a truth value, which asks for all bits.
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

// Computes with the values of one assignment, as wide as they are. Sums and products of bits stay
// far below 64 bits in any text that people write; beyond, they wrap.
class ValueMachine {
  public:
    explicit ValueMachine(const ForeignTree& tree) : m_tree(tree), m_masks(tree.nodes.size(), ~0ull)
    {
        if (tree.notation->values == Values::Vector)
            SpreadWidths();
        m_values.resize(tree.nodes.size());
    }

    // Bit 'lane' of each input is its value.
    bool Run(const std::vector<uint64_t>& inputs, unsigned int lane)
    {
        for (size_t node = 0; node < m_values.size(); ++node)
            m_values[node] = Value(m_tree.nodes[node], inputs, lane) & m_masks[node];
        const uint64_t result = m_values.back();
        return m_tree.notation->values == Values::Int ? result != 0 : (result & 1u) != 0;
    }

  private:
    // An operator works in the width of its context: from the root, or the truth value above, down.
    void SpreadWidths()
    {
        const std::vector<bool> isWide = FindWide(m_tree);
        const auto maskOf = [](bool wide) { return wide ? 0xffffffffull : 1ull; };
        m_masks.back() = maskOf(isWide.back());
        for (size_t node = m_masks.size(); node-- > 0;) {
            const ForeignTree::Node& own = m_tree.nodes[node];
            if (IsLeaf(own.meaning))
                continue;
            const bool isOwnContext = own.meaning == Meaning::LogicalNot;
            m_masks[own.left] = isOwnContext ? maskOf(isWide[own.left]) : m_masks[node];
            if (!IsNot(own.meaning))
                m_masks[own.right] = m_masks[node];
        }
    }

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
    std::vector<uint64_t> m_masks; // the bits of each node's value
    std::vector<uint64_t> m_values;
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

} // namespace booleq
