#include "expression.h"

#include <cassert>

#include <Kq_BoolEquationImpNode.h>

#include "text.h"
#include "watch.h"

namespace booleq {

namespace {

typedef Kq_BoolEquationImp::Node LibraryNode;

// The rows are the operators from And on; the columns are the styles.
constexpr const char* kBinarySpellings[][3] = {
    {"&", "*", ".AND."},    {"|", "+", ".OR."},    {"^", "@", ".XOR."},
    {"~&", "~*", ".NAND."}, {"~|", "~+", ".NOR."}, {"~^", "~@", ".NXOR."},
};
constexpr uint8_t kBang = 4;

Operator OperatorOf(LibraryNode::TYPE type)
{
    switch (type) {
    case LibraryNode::AND:
        return Operator::And;
    case LibraryNode::ONE:
        return Operator::One;
    case LibraryNode::ID:
        return Operator::Input;
    case LibraryNode::NAND:
        return Operator::Nand;
    case LibraryNode::NOR:
        return Operator::Nor;
    case LibraryNode::NOT:
        return Operator::Not;
    case LibraryNode::NXOR:
        return Operator::Nxor;
    case LibraryNode::OR:
        return Operator::Or;
    case LibraryNode::XOR:
        return Operator::Xor;
    case LibraryNode::ZERO:
    case LibraryNode::LP:
    case LibraryNode::RP:
    case LibraryNode::TRUTH_TABLE:
    case LibraryNode::SENTINEL:
        break;
    }
    return Operator::Zero;
}

// The first node at or below 'node' that is neither a group nor an init value; null for an empty
// group.
const LibraryNode* Inside(const LibraryNode* node)
{
    while (node && (node->IsLp() || node->GetType() == LibraryNode::TRUTH_TABLE))
        node = node->GetLeftChild();
    return node;
}

uint32_t Add(Expression& expression, Operator op, uint32_t left, uint32_t right)
{
    assert(op == Operator::Input || left <= expression.nodes.size());
    assert(right <= expression.nodes.size()); // post-order: operands come first
    expression.nodes.push_back({op, 0, left, right});
    return static_cast<uint32_t>(expression.nodes.size() - 1);
}

// Appends the node that stands for 'node', whose operands were appended last; 'operands' are the
// results that wait for their operator.
void Append(Expression& expression, const LibraryNode* node, std::vector<uint32_t>& operands)
{
    const Operator op = node ? OperatorOf(node->GetType()) : Operator::Zero;
    uint32_t left = 0;
    uint32_t right = 0;
    if (op == Operator::Input)
        left = node->GetValue();
    assert(operands.size() >= (IsBinary(op) ? 2u : op == Operator::Not ? 1u : 0u));
    if (IsBinary(op)) {
        right = operands.back();
        operands.pop_back();
    }
    if (IsBinary(op) || op == Operator::Not) {
        left = operands.back();
        operands.pop_back();
    }
    operands.push_back(Add(expression, op, left, right));
    if (IsBinary(op) || op == Operator::Not)
        expression.nodes.back().spelling = StyleOf(ToStd(node->GetToken()));
}

} // namespace

bool IsBinary(Operator op)
{
    return op >= Operator::And;
}

uint32_t AddInput(Expression& expression, uint32_t input)
{
    return Add(expression, Operator::Input, input, 0);
}

uint32_t AddConstant(Expression& expression, bool value)
{
    return Add(expression, value ? Operator::One : Operator::Zero, 0, 0);
}

uint32_t AddNot(Expression& expression, uint32_t operand)
{
    return Add(expression, Operator::Not, operand, 0);
}

uint32_t AddBinary(Expression& expression, Operator op, uint32_t left, uint32_t right)
{
    return Add(expression, op, left, right);
}

Expression ToExpression(const Kq_BoolEquation& equation)
{
    Expression expression;
    expression.names = InputNames(equation);
    struct Visit {
        const LibraryNode* node;
        bool hasOperands; // they have been appended
    };
    std::vector<uint32_t> operands;
    std::vector<Visit> pending = {{Inside(equation.GetImp()->GetRoot()), false}};
    while (!pending.empty()) {
        const Visit visit = pending.back();
        pending.pop_back();
        const Operator op = visit.node ? OperatorOf(visit.node->GetType()) : Operator::Zero;
        if (visit.hasOperands || (op != Operator::Not && !IsBinary(op))) {
            Append(expression, visit.node, operands);
            continue;
        }
        pending.push_back({visit.node, true});
        if (IsBinary(op))
            pending.push_back({Inside(visit.node->GetRightChild()), false});
        pending.push_back({Inside(visit.node->GetLeftChild()), false});
    }
    assert(operands.size() == 1);
    assert(operands.back() + 1 == expression.nodes.size());
    return expression;
}

std::string SpellOperator(Operator op, uint8_t style)
{
    if (op == Operator::Not)
        return (style & 3u) == 2 ? ".NOT." : (style & kBang ? "!" : "~");
    assert(IsBinary(op));
    const auto row = static_cast<size_t>(op) - static_cast<size_t>(Operator::And);
    std::string text = kBinarySpellings[row][style & 3u];
    if (style & kBang && text[0] == '~')
        text[0] = '!';
    return text;
}

uint8_t StyleOf(const std::string& token)
{
    if (token.find('.') != std::string::npos)
        return 2;
    const bool isSecond = token.find_first_of("*+@") != std::string::npos;
    const bool hasBang = token.find('!') != std::string::npos;
    return static_cast<uint8_t>((isSecond ? 1 : 0) + (hasBang ? kBang : 0));
}

uint64_t EvaluateWord(const Expression& expression, const std::vector<uint64_t>& inputs,
                      std::vector<uint64_t>& stack)
{
    stack.clear();
    for (const Expression::Node& node : expression.nodes) {
        if (node.op <= Operator::Input) {
            stack.push_back(node.op == Operator::Input ? inputs[node.left]
                                                       : (node.op == Operator::One ? ~0ull : 0));
            continue;
        }
        if (node.op == Operator::Not) {
            stack.back() = ~stack.back();
            continue;
        }
        const uint64_t right = stack.back();
        stack.pop_back();
        uint64_t& value = stack.back();
        if (node.op == Operator::And || node.op == Operator::Nand)
            value &= right;
        else if (node.op == Operator::Or || node.op == Operator::Nor)
            value |= right;
        else
            value ^= right;
        if (node.op >= Operator::Nand)
            value = ~value;
    }
    assert(stack.size() == 1);
    return stack.back();
}

Function ToFunction(const Expression& expression)
{
    std::vector<uint64_t> stack;
    const auto evaluate = [&](const std::vector<uint64_t>& values) {
        return EvaluateWord(expression, values, stack);
    };
    return Tabulate(evaluate, expression.names);
}

} // namespace booleq
