#include "substitute.h"

#include <cassert>
#include <stdexcept>
#include <unordered_map>
#include <utility>

namespace booleq {

namespace {

// Appends the nodes of 'expression' with input k renumbered places[k]; returns the root.
uint32_t AppendAll(const Expression& expression, const std::vector<uint32_t>& places,
                   Expression& result)
{
    if (result.nodes.size() + expression.nodes.size() > kMaxExpressionNodes)
        throw std::length_error("the expression would have more than " +
                                std::to_string(kMaxExpressionNodes) + " operators and operands");
    const auto offset = static_cast<uint32_t>(result.nodes.size());
    for (Expression::Node node : expression.nodes) {
        if (node.op == Operator::Input) {
            node.left = places[node.left];
        } else {
            node.left += node.op == Operator::Not || IsBinary(node.op) ? offset : 0;
            node.right += IsBinary(node.op) ? offset : 0;
        }
        result.nodes.push_back(node);
    }
    return static_cast<uint32_t>(result.nodes.size() - 1);
}

// Builds an expression without constants. An operand on the stack is a constant, or the nodes from
// 'start' on, the last of which is its root.
class Folder {
  public:
    explicit Folder(Expression& result) : m_result(result) {}

    void Add(const Expression::Node& node)
    {
        const auto start = static_cast<uint32_t>(m_result.nodes.size());
        if (node.op == Operator::Zero || node.op == Operator::One)
            m_operands.push_back({true, node.op == Operator::One, start, 0});
        else if (node.op == Operator::Input)
            m_operands.push_back({false, false, start, Put(node)});
        else if (node.op == Operator::Not)
            Invert(node.spelling);
        else
            Join(node);
    }

    void Finish()
    {
        assert(m_operands.size() == 1);
        if (m_operands.back().isConstant) {
            assert(m_result.nodes.empty());
            AddConstant(m_result, m_operands.back().value);
        }
    }

  private:
    struct Operand {
        bool isConstant;
        bool value;
        uint32_t start; // the nodes from here on are its own
        uint32_t root;
    };

    uint32_t Put(const Expression::Node& node)
    {
        m_result.nodes.push_back(node);
        return static_cast<uint32_t>(m_result.nodes.size() - 1);
    }

    void Invert(uint8_t spelling)
    {
        Operand& operand = m_operands.back();
        if (operand.isConstant)
            operand.value = !operand.value;
        else
            operand.root = Put({Operator::Not, spelling, operand.root, 0});
    }

    void MakeConstant(bool value)
    {
        Operand& operand = m_operands.back();
        m_result.nodes.resize(operand.start);
        operand.isConstant = true;
        operand.value = value;
    }

    void Join(const Expression::Node& node)
    {
        const Operand right = m_operands.back();
        m_operands.pop_back();
        Operand& left = m_operands.back();
        if (!left.isConstant && !right.isConstant) {
            left.root = Put({node.op, node.spelling, left.root, right.root});
            return;
        }
        const bool isInverted = node.op >= Operator::Nand;
        const bool constant = left.isConstant ? left.value : right.value;
        const bool isParity = node.op == Operator::Xor || node.op == Operator::Nxor;
        const bool isAnd = node.op == Operator::And || node.op == Operator::Nand;
        if (left.isConstant) { // it has no nodes, so the right one's are where they belong
            assert(left.start == right.start);
            left = right;
            if (right.isConstant) {
                const bool other = right.value;
                const bool both = isParity ? constant != other
                                  : isAnd  ? constant && other
                                           : constant || other;
                left.value = both != isInverted;
                return;
            }
        }
        const bool decides = !isParity && constant != isAnd;
        if (decides)
            MakeConstant(constant != isInverted);
        else if (isParity ? constant != isInverted : isInverted)
            Invert(node.spelling);
    }

    Expression& m_result;
    std::vector<Operand> m_operands;
};

} // namespace

Expression Substituted(const Expression& expression, const std::vector<Substitute>& substitutes,
                       std::vector<std::string> names)
{
    assert(substitutes.size() == expression.names.size());
    Expression result;
    result.names = std::move(names);
    std::vector<uint32_t> roots; // of what replaces each node
    roots.reserve(expression.nodes.size());
    for (Expression::Node node : expression.nodes) {
        const Substitute* const substitute =
            node.op == Operator::Input ? &substitutes[node.left] : nullptr;
        if (substitute && substitute->expression) {
            roots.push_back(AppendAll(*substitute->expression, substitute->places, result));
            continue;
        }
        if (substitute)
            node.left = substitute->places[0];
        else if (node.op == Operator::Not || IsBinary(node.op))
            node.left = roots[node.left];
        if (IsBinary(node.op))
            node.right = roots[node.right];
        result.nodes.push_back(node);
        roots.push_back(static_cast<uint32_t>(result.nodes.size() - 1));
    }
    assert(roots.empty() || roots.back() + 1 == result.nodes.size());
    return result;
}

Expression Folded(const Expression& expression)
{
    Expression result;
    result.names = expression.names;
    if (expression.nodes.empty())
        return result;
    Folder folder(result);
    for (const Expression::Node& node : expression.nodes)
        folder.Add(node);
    folder.Finish();
    return result;
}

Expression Joined(const Expression& left, Operator op, const Expression& right)
{
    assert(IsBinary(op) && !left.nodes.empty() && !right.nodes.empty());
    Expression result = left;
    const std::vector<uint32_t> places = Merge(right.names, result.names);
    const auto leftRoot = static_cast<uint32_t>(result.nodes.size() - 1);
    const uint32_t rightRoot = AppendAll(right, places, result);
    AddBinary(result, op, leftRoot, rightRoot);
    return result;
}

std::vector<uint32_t> Merge(const std::vector<std::string>& names, std::vector<std::string>& all)
{
    std::unordered_map<std::string, uint32_t> numbers;
    for (size_t input = 0; input < all.size(); ++input)
        numbers.emplace(all[input], static_cast<uint32_t>(input));
    std::vector<uint32_t> places;
    places.reserve(names.size());
    for (const std::string& name : names) {
        const auto added = numbers.emplace(name, static_cast<uint32_t>(all.size()));
        if (added.second)
            all.push_back(name);
        places.push_back(added.first->second);
    }
    return places;
}

std::vector<std::string> NamesInText(const Expression& expression)
{
    std::vector<std::string> names;
    std::vector<bool> isListed(expression.names.size());
    for (const Expression::Node& node :
         expression.nodes) { // post-order keeps the order of operands
        if (node.op != Operator::Input || isListed[node.left])
            continue;
        isListed[node.left] = true;
        names.push_back(expression.names[node.left]);
    }
    return names;
}

} // namespace booleq
