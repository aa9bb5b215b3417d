// The life of an equation: set, clear, compare, evaluate, render.
#include "reference/equation.h"

#include <algorithm>

#include "reference/builder.h"
#include "reference/evaluation.h"
#include "reference/init_text.h"
#include "reference/node_dump.h"
#include "reference/rendering.h"
#include "reference/tokenizer.h"

namespace reference {

namespace {

bool StartsLikeInitValue(const std::string& text)
{
    return text.size() >= 3 && text[0] == '0';
}

std::vector<int> PreOrder(const std::vector<Node>& nodes, int root)
{
    std::vector<int> order;
    std::vector<int> pending;
    if (root != kNone)
        pending.push_back(root);
    while (!pending.empty()) {
        const int node = pending.back();
        pending.pop_back();
        order.push_back(node);
        if (nodes[static_cast<size_t>(node)].right != kNone)
            pending.push_back(nodes[static_cast<size_t>(node)].right);
        if (nodes[static_cast<size_t>(node)].left != kNone)
            pending.push_back(nodes[static_cast<size_t>(node)].left);
    }
    return order;
}

// Only the presence of a node matters, not which one it is.
bool SameNode(const Node& a, const Node& b)
{
    if (a.type != b.type)
        return false;
    if ((a.left == kNone) != (b.left == kNone) || (a.right == kNone) != (b.right == kNone) ||
        (a.parent == kNone) != (b.parent == kNone))
        return false;
    return (a.type != kId && a.type != kTruthTable) || a.token == b.token;
}

} // namespace

void Equation::Clear()
{
    m_store = std::make_shared<Store>();
    m_variables.clear();
}

void Equation::TokenizeNodes(const std::string& text)
{
    if (text.empty() || text[0] == '\0' || !m_store->list.empty())
        return;
    if (!Tokenize(text, m_store->nodes)) {
        Clear();
        return;
    }
    for (int node = 0; node < static_cast<int>(m_store->nodes.size()); ++node)
        m_store->list.push_back(node);
}

void Equation::BuildTree()
{
    if (m_store->root != kNone || m_store->list.empty())
        return;
    const int root = reference::BuildTree(m_store->nodes);
    if (root == kNone)
        Clear();
    else
        m_store->root = root;
}

bool Equation::SetEquation(const std::string& givenText)
{
    const std::string text = givenText; // it may belong to this object
    if (StartsLikeInitValue(text)) {
        const std::string expression = ReadInitValue(text, VariableNames(), false);
        if (!expression.empty()) {
            if (!SetEquation(expression))
                return false;
            PutTruthTableOnTop(text);
            return true;
        }
    }
    return SetExpression(text);
}

bool Equation::SetExpression(const std::string& text)
{
    Clear();
    TokenizeNodes(text);
    BuildTree();
    if (m_store->list.empty())
        return false;
    DefineListedNames();
    ListInPreOrder();
    return true;
}

bool Equation::SetEquationWithExplicitTerms(const std::vector<std::string>& terms,
                                            const std::string& equation, bool termOrderFlag,
                                            bool reverseTerms)
{
    const std::string text = equation;
    const bool isInitValue = StartsLikeInitValue(text);
    std::vector<std::string> names = terms;
    if (isInitValue && reverseTerms)
        std::reverse(names.begin(), names.end());
    Clear();
    for (const std::string& name : names)
        DefineVariable(name, 0);
    TokenizeNodes(isInitValue ? ReadInitValue(text, VariableNames(), termOrderFlag) : text);
    BuildTree();
    if (m_store->list.empty()) {
        Clear();
        return false;
    }
    DefineListedNames();
    if (isInitValue)
        PutTruthTableOnTop(text);
    ListInPreOrder();
    for (int node : m_store->list) {
        if (At(node).type == kId)
            At(node).value = static_cast<unsigned int>(FindVariable(At(node).token));
    }
    return true;
}

void Equation::PutTruthTableOnTop(const std::string& initValue)
{
    const int top = static_cast<int>(m_store->nodes.size());
    m_store->nodes.push_back(Node(kTruthTable, initValue));
    At(top).left = m_store->root;
    At(m_store->root).parent = top;
    m_store->root = top;
    m_store->list.insert(m_store->list.begin(), top);
}

void Equation::DefineListedNames()
{
    for (int node : m_store->list) {
        if (At(node).type == kId)
            DefineVariable(At(node).token, 0);
    }
}

void Equation::ListInPreOrder()
{
    m_store->list = PreOrder(m_store->nodes, m_store->root);
}

unsigned int Equation::Eval() const
{
    if (m_store->root == kNone)
        return 0;
    std::vector<unsigned int> values;
    for (const Variable& variable : m_variables)
        values.push_back(variable.second);
    const unsigned int result = EvalTree(m_store->nodes, m_store->root, values);
    if (DebugMode())
        DumpNode(m_store->nodes, m_store->root);
    return result;
}

bool Equation::operator==(const Equation& other) const
{
    if (m_store->list.size() != other.m_store->list.size())
        return false;
    const std::vector<int> mine = PreOrder(m_store->nodes, m_store->root);
    const std::vector<int> theirs = PreOrder(other.m_store->nodes, other.m_store->root);
    if (mine.size() != theirs.size())
        return false;
    // Equal pre-orders are equal trees if each pair of nodes has children in the same places.
    for (size_t position = 0; position < mine.size(); ++position) {
        if (!SameNode(At(mine[position]), other.At(theirs[position])))
            return false;
    }
    return true;
}

bool Equation::IsExpression() const
{
    return m_store->root != kNone && At(m_store->root).type != kTruthTable;
}

bool Equation::HasPrefix(char lower, char upper) const
{
    if (m_store->root == kNone || At(m_store->root).type != kTruthTable)
        return false;
    const std::string& token = At(m_store->root).token;
    return token.size() >= 2 && token[0] == '0' && (token[1] == lower || token[1] == upper);
}

bool Equation::IsHexInitValue() const
{
    return HasPrefix('x', 'X');
}

bool Equation::IsBinaryInitValue() const
{
    return HasPrefix('b', 'B');
}

std::string Equation::GetEquation(bool spaces) const
{
    if (m_store->root == kNone)
        return "";
    if (!IsExpression())
        return At(m_store->root).token;
    return RenderTree(m_store->nodes, m_store->root, 0, spaces);
}

std::string Equation::RenderAlternative(int syntax, bool spaces) const
{
    if (m_store->root == kNone)
        return "";
    const int start = IsExpression() ? m_store->root : At(m_store->root).left;
    return RenderTree(m_store->nodes, start, syntax, spaces);
}

std::string Equation::GetEquationAsExpression(bool spaces) const
{
    return IsExpression() ? GetEquation(spaces) : GetEquationAlt1(spaces);
}

std::vector<FlatNode> Flatten(const Store& store)
{
    const std::vector<int> order = PreOrder(store.nodes, store.root);
    std::vector<int> positions(store.nodes.size(), kNone);
    for (size_t position = 0; position < order.size(); ++position)
        positions[static_cast<size_t>(order[position])] = static_cast<int>(position);
    const auto positionOf = [&positions](int node) {
        return node == kNone ? kNone : positions[static_cast<size_t>(node)];
    };
    std::vector<FlatNode> flat;
    for (int index : order) {
        const Node& node = store.nodes[static_cast<size_t>(index)];
        flat.push_back(FlatNode{node.type, node.token, positionOf(node.parent),
                                positionOf(node.left), positionOf(node.right), node.value});
    }
    return flat;
}

} // namespace reference
