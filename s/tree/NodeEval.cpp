// The value of a subtree for one table of variable values; no recursion.
// In debug mode one line for each node goes to the message manager, children before their parent.
#include "NodeEval.h"

#include "Messages.h"
#include "Operands.h"
#include "Walk.h"

typedef Kq_BoolEquationImp::Node Node;
typedef Port::StringBase<char> String;
typedef std::vector<std::pair<String, unsigned int>> Variables;

namespace {

// The evaluation trace carries fixed line numbers, which are not lines of this file.
constexpr int kTraceLine = 444;
constexpr int kTraceTextLine = 446;

// An index beyond the table counts as 0.
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

struct Place {
    const Node* node;  // null counts as 0
    unsigned int left; // value of the left operand, once it is known
};

// Keeps the value of the subtree that was left last; afterLeave(node, value) gets each value.
template <class AfterLeave>
struct Evaluator {
    Evaluator(const Variables& table, AfterLeave after) : variables(table), afterLeave(after) {}

    unsigned int Enter(Place& place, Place& left, Place&)
    {
        if (!place.node) {
            value = 0;
            return KQ_NONE;
        }
        const unsigned int numOperands = KqNumOperands(place.node->GetType());
        if (numOperands == 0) {
            Leave(place);
            return KQ_NONE;
        }
        left.node = place.node->GetLeftChild();
        return (numOperands == 2 ? KQ_BOTH : KQ_ONE) | KQ_RETURN;
    }

    bool Between(Place& place, Place& right)
    {
        place.left = value;
        right.node = place.node->GetRightChild();
        return true;
    }

    void Leave(const Place& place)
    {
        const bool isUnary = KqNumOperands(place.node->GetType()) == 1;
        value = Combine(*place.node, isUnary ? value : place.left, value, variables);
        afterLeave(*place.node, value);
    }

    const Variables& variables;
    AfterLeave afterLeave;
    unsigned int value = 0;
};

template <class AfterLeave>
unsigned int EvalTree(const Node& root, const Variables& variables, AfterLeave afterLeave)
{
    Evaluator<AfterLeave> evaluator(variables, afterLeave);
    KqWalk(Place{&root, 0}, evaluator);
    return evaluator.value;
}

} // namespace

unsigned int KqEvalSilently(const Node& root, const Variables& variables)
{
    return EvalTree(root, variables, [](const Node&, unsigned int) {});
}

unsigned int Node::Eval(const Variables& variables) const
{
    return EvalTree(*this, variables, [](const Node& node, unsigned int value) {
        // Read for each value: a message's receiver may have changed the switch.
        if (!KqDebugMode::IsOn())
            return;
        String name;
        node.DbgName(name);
        KQ_EMIT(kKqNodeModule, kTraceLine, "DEBUG:%s:%d Eval %s type=%s token=%s value=%d\n",
                kKqNodeModule.path, kTraceTextLine, name.c_str(), node.GetTypeName().c_str(),
                node.m_token.c_str(), static_cast<int>(value));
    });
}
