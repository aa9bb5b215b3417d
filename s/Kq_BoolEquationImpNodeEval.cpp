// The value of a subtree for one table of variable values; no recursion.
// In debug mode one line for each node, children before their parent, goes to the message manager.
#include <Kq_BoolEquationImpNode.h>

#include "Kq_BoolEquationImpDiag.h"
#include "Kq_BoolEquationImpWalk.h"

typedef Kq_BoolEquationImp::Node Node;
typedef Port::StringBase<char> String;
typedef std::vector<std::pair<String, unsigned int>> Variables;

namespace {

// The evaluation trace carries fixed numbers; they name no line of this file.
constexpr int kTraceLine = 444;
constexpr int kTraceTextLine = 446;

// How many children take part in a node's value.
unsigned int NumOperands(Node::TYPE type)
{
    switch (type) {
    case Node::AND:
    case Node::NAND:
    case Node::NOR:
    case Node::NXOR:
    case Node::OR:
    case Node::XOR:
        return 2;
    case Node::NOT:
    case Node::LP:
    case Node::TRUTH_TABLE:
        return 1;
    case Node::ZERO:
    case Node::ONE:
    case Node::ID:
    case Node::RP:
    case Node::SENTINEL:
        return 0;
    }
    return 0;
}

// An index beyond the table reads as 0.
unsigned int VariableValue(unsigned int variableIndex, const Variables& variables)
{
    return variableIndex < variables.size() ? variables[variableIndex].second : 0u;
}

// Deliberate: AND and OR keep all bits of their operands, the others give 0 or 1.
unsigned int Combine(const Node& node, unsigned int left, unsigned int right,
                     const Variables& variables)
{
    switch (node.GetType()) {
    case Node::AND:
        return left & right;
    case Node::OR:
        return left | right;
    case Node::XOR:
        return left != right ? 1u : 0u;
    case Node::NAND:
        return (left & right) == 0 ? 1u : 0u;
    case Node::NOR:
        return (left | right) == 0 ? 1u : 0u;
    case Node::NXOR:
        return left == right ? 1u : 0u;
    case Node::NOT:
        return left == 0 ? 1u : 0u;
    case Node::ONE:
        return 1;
    case Node::ID:
        return VariableValue(node.GetValue(), variables);
    case Node::LP:
    case Node::TRUTH_TABLE:
        return left;
    case Node::ZERO:
    case Node::RP:
    case Node::SENTINEL:
        return 0;
    }
    return 0;
}

// A node whose operands are being evaluated.
struct Frame {
    const Node* node;
    unsigned int numOperandsDone;
    unsigned int left;
};

} // namespace

unsigned int Node::Eval(const Variables& variables) const
{
    const bool isTracing = GetInternalDebugMode();
    KqStack<Frame, 64> frames;
    frames.Push({this, 0, 0});
    unsigned int value = 0;
    while (!frames.IsEmpty()) {
        Frame& frame = frames.Top();
        const Node* node = frame.node;
        const unsigned int numOperands = NumOperands(node->m_type);
        if (frame.numOperandsDone == 1)
            frame.left = value;
        if (frame.numOperandsDone < numOperands) {
            const Node* operand =
                frame.numOperandsDone == 0 ? node->m_left_child : node->m_right_child;
            ++frame.numOperandsDone;
            value = 0; // what a missing operand counts as
            if (operand)
                frames.Push({operand, 0, 0});
            continue;
        }
        value = Combine(*node, frame.left, value, variables);
        frames.Pop();
        if (!isTracing)
            continue;
        String name;
        node->DbgName(name);
        KQ_EMIT(kKqNodeModule, kTraceLine, "DEBUG:%s:%d Eval %s type=%s token=%s value=%d\n",
                kKqNodeModule.path, kTraceTextLine, name.c_str(), node->GetTypeName().c_str(),
                node->m_token.c_str(), static_cast<int>(value));
    }
    return value;
}
