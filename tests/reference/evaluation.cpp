// Post-order with an explicit stack. A group and a truth table have their left operand's value; the
// closing parenthesis is not visited.
#include "reference/evaluation.h"

#include <utility>

#include "reference/message.h"
#include "reference/node_dump.h"

namespace reference {

namespace {

const int kTraceLine = 444;
const int kPrintedTraceLine = 446;

unsigned int Combine(const Node& node, unsigned int left, unsigned int right,
                     const std::vector<unsigned int>& values)
{
    switch (node.type) {
    case kAnd:
        return left & right;
    case kOr:
        return left | right;
    case kXor:
        return left != right ? 1 : 0;
    case kNand:
        return (left & right) == 0 ? 1 : 0;
    case kNor:
        return (left | right) == 0 ? 1 : 0;
    case kNxor:
        return left == right ? 1 : 0;
    case kNot:
        return left == 0 ? 1 : 0;
    case kOne:
        return 1;
    case kId:
        return node.value < values.size() ? values[node.value] : 0;
    case kLp:
    case kTruthTable:
        return left;
    case kZero:
    case kRp:
    case kSentinel:
        return 0;
    }
    return 0;
}

void Trace(const std::vector<Node>& nodes, int index, unsigned int value)
{
    const Node& node = nodes[static_cast<size_t>(index)];
    Emit(Module::Node, kTraceLine,
         std::string("DEBUG:") + NodeModulePath() + ":" + std::to_string(kPrintedTraceLine) +
             " Eval " + PathName(nodes, index) + " type=" + TypeName(node.type) +
             " token=" + CText(node.token) + " value=" + Decimal(value) + "\n");
}

bool TakesRight(Type type)
{
    return IsBinOp(type) && type != kZero && type != kOne && type != kTruthTable;
}

} // namespace

unsigned int EvalTree(const std::vector<Node>& nodes, int root,
                      const std::vector<unsigned int>& values)
{
    std::vector<unsigned int> results(nodes.size(), 0);
    std::vector<std::pair<int, bool>> pending; // node, whether its operands are done
    pending.push_back({root, false});
    while (!pending.empty()) {
        const int index = pending.back().first;
        const Node& node = nodes[static_cast<size_t>(index)];
        const int right = TakesRight(node.type) ? node.right : kNone;
        if (!pending.back().second) {
            pending.back().second = true;
            if (right != kNone)
                pending.push_back({right, false});
            if (node.left != kNone)
                pending.push_back({node.left, false});
            continue;
        }
        pending.pop_back();
        const unsigned int leftValue =
            node.left == kNone ? 0 : results[static_cast<size_t>(node.left)];
        const unsigned int rightValue = right == kNone ? 0 : results[static_cast<size_t>(right)];
        const unsigned int value = Combine(node, leftValue, rightValue, values);
        results[static_cast<size_t>(index)] = value;
        if (DebugMode())
            Trace(nodes, index, value);
    }
    return results[static_cast<size_t>(root)];
}

} // namespace reference
