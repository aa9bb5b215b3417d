// The cursor is the node placed last. Operands go below it, operators above it. All binary
// operators have one precedence and group from the left. "X ~ & Y" becomes NOT(AND(X, Y)).
#include "reference/builder.h"

#include <map>

#include "reference/message.h"
#include "reference/node_dump.h"

namespace reference {

namespace {

class Builder {
  public:
    explicit Builder(std::vector<Node>& nodes) : m_nodes(nodes) {}
    int Build();

  private:
    Node& At(int node) { return m_nodes[static_cast<size_t>(node)]; }
    bool IsNot(int node) { return At(node).type == kNot; }

    int Above(int node);
    int TopOf(int node);
    void HangUnder(int child, int operatorNode);

    bool Place(int node);
    bool PlaceOperand(int node);
    bool PlaceClose(int close);
    bool PlaceOperator(int node);
    void TakePlaceOf(int node, int highest);
    bool InsertBelow(int node, int ancestor);
    bool PlaceNegatedOperator(int node);

    bool HasRightChildren(int node);
    int Validate();
    void ReportFailure(int node);

    std::vector<Node>& m_nodes;
    int m_cursor = 0;
    // For the top NOT of a negated operator inside another node: the node that holds it. The NOT's
    // own parent link points down, to the operator's first operand.
    std::map<int, int> m_holders;
    bool m_had_inner_negation = false;
};

// The next node of an upward walk.
int Builder::Above(int node)
{
    const auto holder = m_holders.find(node);
    return holder == m_holders.end() ? At(node).parent : holder->second;
}

int Builder::TopOf(int node)
{
    while (Above(node) != kNone)
        node = Above(node);
    return node;
}

// Makes the operator the parent of 'child', which also corrects a stale parent link.
void Builder::HangUnder(int child, int operatorNode)
{
    At(child).parent = operatorNode;
    m_holders.erase(child);
}

void Builder::ReportFailure(int node)
{
    const size_t numBefore = Log().size();
    DumpFailure(m_nodes, node);
    for (size_t position = numBefore; position < Log().size(); ++position)
        Log()[position].isFree = m_had_inner_negation;
}

bool Builder::PlaceOperand(int node)
{
    if (At(m_cursor).left == kNone)
        At(m_cursor).left = node;
    else if (At(m_cursor).right == kNone)
        At(m_cursor).right = node;
    else
        return false;
    At(node).parent = m_cursor;
    m_cursor = node;
    return true;
}

bool Builder::PlaceClose(int close)
{
    int node = m_cursor;
    while (node != kNone) {
        if (At(node).type == kLp && At(node).right == kNone)
            break;
        // The open group may be the first operand of the negated operator itself.
        const int operand = m_holders.count(node) ? At(node).parent : kNone;
        if (operand != kNone && At(operand).type == kLp && At(operand).right == kNone)
            node = operand;
        else
            node = Above(node);
    }
    if (node == kNone)
        return false;
    At(node).right = close;
    At(close).parent = node;
    m_cursor = node;
    return true;
}

void Builder::TakePlaceOf(int node, int highest)
{
    const int parent = At(highest).parent;
    if (parent != kNone && At(parent).left == highest)
        At(parent).left = node;
    else if (parent != kNone && At(parent).right == highest)
        At(parent).right = node;
    At(node).parent = parent;
    At(node).left = highest;
    HangUnder(highest, node);
}

// 'ancestor' is not an operator but an open group or, in a text that will be refused, an operand
// with children.
bool Builder::InsertBelow(int node, int ancestor)
{
    if (At(ancestor).left == m_cursor) {
        At(ancestor).left = node;
        At(node).left = m_cursor;
    } else if (At(ancestor).right == m_cursor) {
        At(ancestor).right = node;
        At(node).right = m_cursor;
    } else {
        if (At(ancestor).type != kLp)
            return false;
        while (Above(m_cursor) != kNone && IsNot(Above(m_cursor)))
            m_cursor = Above(m_cursor);
        At(ancestor).left = node;
        At(node).left = m_cursor;
    }
    At(node).parent = ancestor;
    HangUnder(m_cursor, node);
    return true;
}

bool Builder::PlaceOperator(int node)
{
    int ancestor = Above(m_cursor);
    while (ancestor != kNone && IsNot(ancestor))
        ancestor = Above(ancestor);
    if (ancestor == kNone) {
        const int top = TopOf(m_cursor);
        At(node).left = top;
        HangUnder(top, node);
    } else if (IsBinOp(At(ancestor).type)) {
        int highest = ancestor;
        while (Above(highest) != kNone && IsBinOp(At(Above(highest)).type))
            highest = Above(highest);
        TakePlaceOf(node, highest);
    } else if (!InsertBelow(node, ancestor)) {
        return false;
    }
    m_cursor = node;
    return true;
}

// The cursor is a NOT without an operand, placed below the operand X before it: "X ~ op Y" becomes
// "~(X op Y)".
bool Builder::PlaceNegatedOperator(int node)
{
    int chainTop = m_cursor;
    while (Above(chainTop) != kNone && IsNot(Above(chainTop)))
        chainTop = Above(chainTop);
    const int operand = Above(chainTop);
    if (operand == kNone || At(operand).left != chainTop) {
        ReportFailure(m_cursor);
        return false;
    }
    const int holder = At(operand).parent;
    At(m_cursor).left = node;
    At(node).parent = m_cursor;
    At(node).left = operand;
    At(operand).parent = node;
    At(operand).left = kNone;
    if (holder == kNone) {
        At(chainTop).parent = kNone;
    } else {
        if (At(holder).left == operand)
            At(holder).left = chainTop;
        else if (At(holder).right == operand)
            At(holder).right = chainTop;
        m_holders[chainTop] = holder;
        m_had_inner_negation = true;
    }
    m_cursor = node;
    return true;
}

bool Builder::Place(int node)
{
    switch (At(node).type) {
    case kLp:
    case kNot:
    case kId:
    case kZero:
    case kOne:
        return PlaceOperand(node);
    case kRp:
        return PlaceClose(node);
    default:
        break;
    }
    if (!IsBinOp(At(node).type))
        return false;
    return IsNot(m_cursor) ? PlaceNegatedOperator(node) : PlaceOperator(node);
}

bool Builder::HasRightChildren(int index)
{
    const Node& node = At(index);
    switch (node.type) {
    case kNot:
        return node.left != kNone && node.right == kNone;
    case kId:
    case kZero:
    case kOne:
    case kRp:
        return node.left == kNone && node.right == kNone;
    case kLp:
        return node.right != kNone && At(node.right).type == kRp;
    case kSentinel:
        return false;
    default:
        return node.left != kNone && node.right != kNone;
    }
}

int Builder::Validate()
{
    int root = kNone;
    for (int node = 0; node < static_cast<int>(m_nodes.size()); ++node) {
        const bool isSecondRoot = At(node).parent == kNone && root != kNone;
        if (isSecondRoot || !HasRightChildren(node)) {
            ReportFailure(node);
            return kNone;
        }
        if (At(node).parent == kNone)
            root = node;
    }
    return root;
}

int Builder::Build()
{
    for (int node = 1; node < static_cast<int>(m_nodes.size()); ++node) {
        if (DebugMode())
            DumpNode(m_nodes, TopOf(m_cursor));
        if (!Place(node))
            return kNone;
    }
    if (DebugMode())
        DumpNode(m_nodes, TopOf(m_cursor));
    return Validate();
}

} // namespace

int BuildTree(std::vector<Node>& nodes)
{
    return Builder(nodes).Build();
}

} // namespace reference
