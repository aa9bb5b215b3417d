// Places tokens one after another: operands below what precedes them, operators above. The rules of
// placement are those of the text syntax; each function below states one.
#include "Builder.h"

#include <cassert>
#include <cstdint>
#include <unordered_map>

#include "Messages.h"

typedef Kq_BoolEquationImp::Node Node;
typedef Kq_BoolEquation::Refusal Refusal;

namespace {

// Links the nodes of one list. Its cursor is the node placed last.
//
// Invariants:
// 1. Child links form a tree at all times.
// 2. A node's parent link names the node that has it as a child, except for the keys of m_holders.
class TreeBuilder {
  public:
    TreeBuilder(const std::vector<Node*>& nodes, bool isTraced)
        : m_nodes(nodes), m_cursor(nodes[0]), m_is_traced(isTraced)
    {
    }

    KqBuildResult Build()
    {
        for (size_t position = 1; position < m_nodes.size(); ++position) {
            Trace();
            if (!Place(m_nodes[position]))
                return m_result;
        }
        Trace();
        m_result.root = FindRoot();
        return m_result;
    }

  private:
    // The switch is read each time: a message's receiver may have changed it.
    void Trace() const
    {
        if (m_is_traced && KqDebugMode::IsOn())
            TopOfCursor()->Dbg();
    }

    bool Place(Node* node);
    bool PlaceOperand(Node* node);
    bool PlaceRightParen(Node* node);
    bool PlaceOperator(Node* node);
    bool PlaceInGroup(Node* node, Node* anchor);
    bool PlaceNegatedOperator(Node* node);
    Node* FindRoot();

    bool Refuse(Refusal::CODE code, const Node* node, size_t numAfter = 0);
    bool RefuseRightParen(const Node* node);
    bool RefuseChildren(const Node* node);

    // The node that has 'node' as a child, null at the top. All walks up go this way, so they end:
    // they follow child links backwards, and those form a tree (invariants 1 and 2).
    Node* Up(Node* node) const
    {
        if (node->IsNot() && !m_holders.empty()) {
            const auto holder = m_holders.find(node);
            if (holder != m_holders.end())
                return holder->second;
        }
        return node->GetParent();
    }

    Node* TopOfCursor() const
    {
        Node* node = m_cursor;
        while (Node* above = Up(node))
            node = above;
        return node;
    }

    // Makes 'operand' the left operand of 'node'; its parent link is correct from then on.
    void TakeLeft(Node* node, Node* operand)
    {
        assert(!node->GetLeftChild());
        node->SetLeftChild(operand);
        operand->SetParent(node);
        if (operand->IsNot() && !m_holders.empty())
            m_holders.erase(operand);
    }

    // Requires: 'child' is a child of 'parent'.
    static void ReplaceChild(Node* parent, const Node* child, Node* replacement)
    {
        assert(parent->GetLeftChild() == child || parent->GetRightChild() == child);
        if (parent->GetLeftChild() == child)
            parent->SetLeftChild(replacement);
        else
            parent->SetRightChild(replacement);
    }

    const std::vector<Node*>& m_nodes;
    Node* m_cursor;
    bool m_is_traced;
    KqBuildResult m_result;
    // The top NOT of a negated operator inside something keeps its parent link to the operator's
    // first operand; this maps it to the node that has it as a child.
    std::unordered_map<const Node*, Node*> m_holders;
};

bool TreeBuilder::Place(Node* node)
{
    switch (node->GetType()) {
    case Node::LP:
    case Node::NOT:
    case Node::ID:
    case Node::ZERO:
    case Node::ONE:
        return PlaceOperand(node);
    case Node::RP:
        return PlaceRightParen(node);
    case Node::AND:
    case Node::NAND:
    case Node::NOR:
    case Node::NXOR:
    case Node::OR:
    case Node::TRUTH_TABLE:
    case Node::XOR:
    case Node::SENTINEL: // no token makes one
        break;
    }
    return m_cursor->IsNot() ? PlaceNegatedOperator(node) : PlaceOperator(node);
}

bool TreeBuilder::PlaceOperand(Node* node)
{
    if (!m_cursor->GetLeftChild())
        m_cursor->SetLeftChild(node);
    else if (!m_cursor->GetRightChild())
        m_cursor->SetRightChild(node);
    else
        return Refuse(Refusal::OPERAND, node);
    node->SetParent(m_cursor);
    m_cursor = node;
    return true;
}

// Closes the nearest open group, which becomes the cursor: it is now the operand placed last.
bool TreeBuilder::PlaceRightParen(Node* node)
{
    const auto isOpen = [](const Node* group) { return group->IsLp() && !group->GetRightChild(); };
    Node* group = m_cursor;
    while (group && !isOpen(group)) {
        // Deliberate: seen from the top NOT of a negated operator, an open "(" that is the
        // operator's first operand is nearer than anything that holds the NOT.
        Node* parent = group->GetParent();
        group = parent && isOpen(parent) ? parent : Up(group);
    }
    if (!group)
        return RefuseRightParen(node);
    group->SetRightChild(node);
    node->SetParent(group);
    m_cursor = group;
    return true;
}

// A binary operator after anything but a NOT.
bool TreeBuilder::PlaceOperator(Node* node)
{
    // The first ancestor that is not a NOT, and the node below it.
    Node* below = m_cursor;
    Node* anchor = Up(m_cursor);
    while (anchor && anchor->IsNot()) {
        below = anchor;
        anchor = Up(anchor);
    }
    if (!anchor) {
        TakeLeft(node, below);
    } else if (anchor->IsBinOp()) {
        // All operators have one precedence: this one takes the place of the highest one of the
        // run.
        // Deliberate: IsBinOp is used as it is, so a constant in an operand's place counts; only
        // the dump of the failing build can show it.
        Node* highest = anchor;
        Node* above = Up(highest);
        while (above && above->IsBinOp()) {
            highest = above;
            above = Up(highest);
        }
        if (above)
            ReplaceChild(above, highest, node);
        node->SetParent(above);
        TakeLeft(node, highest);
    } else if (!PlaceInGroup(node, anchor)) {
        return false;
    }
    m_cursor = node;
    return true;
}

// A binary operator whose 'anchor' is not an operator: the operator becomes the anchor's left child
// in the cursor's place. The anchor's right child is never an operand: only operators have one
// there.
bool TreeBuilder::PlaceInGroup(Node* node, Node* anchor)
{
    if (anchor->GetLeftChild() == m_cursor) {
        anchor->SetLeftChild(node);
        TakeLeft(node, m_cursor);
    } else {
        if (!anchor->IsLp())
            return RefuseChildren(anchor);
        Node* operand = m_cursor;
        for (Node* above = Up(operand); above && above->IsNot(); above = Up(operand))
            operand = above;
        anchor->SetLeftChild(node);
        TakeLeft(node, operand);
    }
    node->SetParent(anchor);
    return true;
}

// A binary operator after a NOT without an operand: "X ~ op Y" means "~(X op Y)". At this point the
// NOT hangs below X; the chain of NOTs moves to where X was, and X moves below the operator.
bool TreeBuilder::PlaceNegatedOperator(Node* node)
{
    Node* chainTop = m_cursor;
    Node* operand = Up(m_cursor);
    while (operand && operand->IsNot()) {
        chainTop = operand;
        operand = Up(operand);
    }
    // The chain must be the operand's left child; in "A & ~ | B" A already has that place.
    if (!operand || operand->GetLeftChild() != chainTop) {
        m_result.broken = m_cursor;
        return Refuse(Refusal::NEGATED_OPERATOR, m_cursor);
    }
    Node* holder = operand->GetParent();
    m_cursor->SetLeftChild(node);
    node->SetParent(m_cursor);
    TakeLeft(node, operand);
    operand->SetLeftChild(nullptr);
    if (holder) {
        // Deliberate: the chain's own parent link still points at the operand, and dumps show it.
        ReplaceChild(holder, operand, chainTop);
        m_holders[chainTop] = holder;
    } else {
        chainTop->SetParent(nullptr);
    }
    m_cursor = node;
    return true;
}

// Records which token is to blame, in case the caller asks: the one 'numAfter' tokens after the
// node, in text order.
bool TreeBuilder::Refuse(Refusal::CODE code, const Node* node, size_t numAfter)
{
    // The first token is placed unchecked, and a ")" there is the fault whatever follows from it.
    const Node* first = m_nodes[0];
    assert(node >= first);
    assert(static_cast<size_t>(node - first) + numAfter < m_nodes.size());
    m_result.refusal = first->IsRp() ? Refusal::PAREN : code;
    // Nodes lie side by side in text order.
    m_result.refusedPosition = first->IsRp() ? 0 : static_cast<size_t>(node - first) + numAfter;
    return false;
}

// A ")" that finds no open group. If a "(" is still open, the operator directly after it, perhaps
// with a separate negation, has taken it as its operand and is to blame.
bool TreeBuilder::RefuseRightParen(const Node* node)
{
    for (const Node* earlier = m_nodes[0]; earlier != node; ++earlier) {
        if (!earlier->IsLp() || earlier->GetRightChild())
            continue;
        const Node* taker = earlier + 1;
        while (taker->IsNot() && taker[1].IsNot())
            ++taker;
        return Refuse(taker->IsNot() ? Refusal::NEGATED_OPERATOR : Refusal::NO_LEFT_OPERAND, taker);
    }
    return Refuse(Refusal::PAREN, node);
}

// Refuses a node whose children are not those that its type allows.
bool TreeBuilder::RefuseChildren(const Node* node)
{
    // Anything below a name or constant was written directly after it.
    if (node->IsId() || node->IsConst())
        return Refuse(Refusal::OPERAND, node, 1);
    if (node->IsNot())
        return Refuse(Refusal::NO_OPERAND, node);
    // The first token has no operand before it, so its right operand was placed on the left.
    return Refuse(node == m_nodes[0] ? Refusal::NO_LEFT_OPERAND : Refusal::NO_RIGHT_OPERAND, node);
}

// Which children a node has, as bits of what its type allows.
enum CHILDREN : unsigned int { NO_CHILD = 1, LEFT_CHILD = 2, RIGHT_CHILD = 4, BOTH_CHILDREN = 8 };

constexpr unsigned int AllowedChildren(Node::TYPE type)
{
    switch (type) {
    case Node::NOT:
        return LEFT_CHILD;
    case Node::ID:
    case Node::ZERO:
    case Node::ONE:
    case Node::RP:
        return NO_CHILD;
    case Node::LP:
        return RIGHT_CHILD | BOTH_CHILDREN; // "()" is an empty group
    case Node::AND:
    case Node::NAND:
    case Node::NOR:
    case Node::NXOR:
    case Node::OR:
    case Node::TRUTH_TABLE:
    case Node::XOR:
    case Node::SENTINEL: // no token makes one
        break;
    }
    return BOTH_CHILDREN;
}

struct AllowedTable {
    uint8_t of[Node::SENTINEL + 1];
};

constexpr AllowedTable MakeAllowedTable()
{
    AllowedTable table = {};
    for (unsigned int type = 0; type <= Node::SENTINEL; ++type)
        table.of[type] = static_cast<uint8_t>(AllowedChildren(static_cast<Node::TYPE>(type)));
    return table;
}

// A table, because the types in a text follow no pattern that a processor could predict.
constexpr AllowedTable kAllowed = MakeAllowedTable();

bool HasAllowedChildren(const Node& node)
{
    const Node* const right = node.GetRightChild();
    const unsigned int children = (node.GetLeftChild() ? 1u : 0u) + (right ? 2u : 0u);
    assert(node.GetType() <= Node::SENTINEL);
    if ((kAllowed.of[node.GetType()] >> children & 1u) == 0)
        return false;
    assert(right || !node.IsLp());
    return !node.IsLp() || right->IsRp();
}

// Checks every node; the one without a parent is the root.
Node* TreeBuilder::FindRoot()
{
    Node* root = nullptr;
    for (Node* node : m_nodes) {
        const bool isSecondRoot = root && !node->GetParent();
        if (isSecondRoot || !HasAllowedChildren(*node)) {
            m_result.broken = node;
            RefuseChildren(node);
            return nullptr;
        }
        if (!node->GetParent())
            root = node;
    }
    assert(root); // invariant 1: a tree has a top
    return root;
}

} // namespace

KqBuildResult KqBuildTree(const std::vector<Node*>& list, bool isTraced)
{
    const KqBuildResult result = TreeBuilder(list, isTraced).Build();
    assert(!result.root || result.refusal == Refusal::NONE);
    assert(result.root || result.refusal != Refusal::NONE);
    return result;
}
