#include "flatten.h"

#include <cassert>

#include "watch.h"

namespace booleq {

namespace {

constexpr size_t kWatchedNodes = 4096;

// How the operator around a node uses it.
enum class Chain : uint8_t { None, And, Xor };
struct Context {
    Chain chain;     // the chain that the node is an operand of
    bool isInverted; // the chain takes the inverse of the node
};

// Every operator is a chain with inversions at its inputs and at its output.
struct Shape {
    Chain chain;
    bool invertsInputs;
    bool invertsOutput;
};

Shape ShapeOf(Operator op)
{
    switch (op) {
    case Operator::And:
        return {Chain::And, false, false};
    case Operator::Or:
        return {Chain::And, true, true};
    case Operator::Xor:
        return {Chain::Xor, false, false};
    case Operator::Nand:
        return {Chain::And, false, true};
    case Operator::Nor:
        return {Chain::And, true, false};
    case Operator::Nxor:
        return {Chain::Xor, false, true};
    case Operator::Zero:
    case Operator::One:
    case Operator::Input:
    case Operator::Not:
        break;
    }
    return {Chain::None, false, false};
}

// Whether a node's operands join those of the chain around it.
bool IsAbsorbed(const Shape& shape, const Context& context)
{
    return shape.chain == context.chain &&
           (shape.chain == Chain::Xor || shape.invertsOutput == context.isInverted);
}

// From the root down. Post-order is read from back to front: a node's right operand comes next, and
// the left one after all of that.
std::vector<Context> ContextsOf(const Expression& expression)
{
    std::vector<Context> contexts(expression.nodes.size());
    std::vector<Context> waiting = {
        {Chain::None, false}}; // contexts of nodes to come, the next one last
    for (size_t index = expression.nodes.size(); index-- > 0;) {
        const Expression::Node& node = expression.nodes[index];
        assert(!waiting.empty());
        const Context context = contexts[index] = waiting.back();
        waiting.pop_back();
        if (node.op == Operator::Not)
            waiting.push_back({context.chain, !context.isInverted});
        if (!IsBinary(node.op))
            continue;
        const Shape shape = ShapeOf(node.op);
        // An exclusive OR that joins another one hands its inversion on to one of its operands.
        const bool handsOn = shape.chain == Chain::Xor && IsAbsorbed(shape, context) &&
                             shape.invertsOutput != context.isInverted;
        waiting.push_back({shape.chain, shape.invertsInputs != handsOn});
        waiting.push_back({shape.chain, shape.invertsInputs});
    }
    assert(waiting.empty());
    return contexts;
}

} // namespace

Edge AddExpression(const Expression& expression, const std::vector<Edge>& inputs, GateGraph& graph)
{
    assert(!expression.nodes.empty());
    const std::vector<Context> contexts = ContextsOf(expression);
    std::vector<Edge> operands;
    std::vector<size_t> counts; // how many of the operands belong to each waiting node
    for (size_t index = 0; index < expression.nodes.size(); ++index) {
        if (index % kWatchedNodes == 0)
            Watch();
        const Expression::Node& node = expression.nodes[index];
        const bool isInverted = contexts[index].isInverted;
        if (node.op == Operator::Not)
            continue; // its operand has taken the inversion
        if (!IsBinary(node.op)) {
            const Edge edge = node.op == Operator::Input
                                  ? inputs[node.left]
                                  : InvertedIf(kFalseEdge, node.op == Operator::One);
            operands.push_back(InvertedIf(edge, isInverted));
            counts.push_back(1);
            continue;
        }
        const size_t numRight = counts.back();
        counts.pop_back();
        counts.back() += numRight;
        const Shape shape = ShapeOf(node.op);
        if (IsAbsorbed(shape, contexts[index]))
            continue;
        Edge* const last = operands.data() + operands.size();
        Edge* const first = last - counts.back();
        const Edge edge =
            shape.chain == Chain::And ? graph.AndOfAll(first, last) : graph.XorOfAll(first, last);
        operands.resize(operands.size() - counts.back());
        operands.push_back(InvertedIf(edge, shape.invertsOutput != isInverted));
        counts.back() = 1;
    }
    assert(operands.size() == 1 && counts.size() == 1);
    return operands.back();
}

} // namespace booleq
