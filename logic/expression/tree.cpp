#include "tree.h"

#include <Kq_BoolEquationImp.h>
#include <Kq_BoolEquationImpNode.h>

#include "text.h"

namespace booleq {

namespace {

typedef Kq_BoolEquationImp::Node Node;

const Node& AsNode(const void* node)
{
    return *static_cast<const Node*>(node);
}

std::string DotString(const std::string& text)
{
    std::string quoted = "\"";
    for (const char character : text) {
        if (character == '"' || character == '\\')
            quoted += '\\';
        quoted += character;
    }
    return quoted + "\"";
}

} // namespace

// Uses an explicit stack, because the text decides the depth.
TreeList::TreeList(const Kq_BoolEquation& equation)
{
    struct Pending {
        const Node* node;
        size_t depth;
        size_t parent;
        bool isRight;
    };
    std::vector<Pending> pending = {{equation.GetImp()->GetRoot(), 0, kNoNode, false}};
    while (!pending.empty()) {
        const Pending next = pending.back();
        pending.pop_back();
        const size_t index = m_entries.size();
        m_entries.push_back({next.depth, next.parent});
        m_nodes.push_back(next.node);
        if (next.parent != kNoNode)
            (next.isRight ? m_entries[next.parent].right : m_entries[next.parent].left) = index;
        const Node* right = next.node->GetRightChild();
        if (right && !right->IsRp())
            pending.push_back({right, next.depth + 1, index, true});
        if (next.node->GetLeftChild())
            pending.push_back({next.node->GetLeftChild(), next.depth + 1, index, false});
    }
}

std::string TreeList::TypeName(size_t index) const
{
    const Node& node = AsNode(m_nodes[index]);
    return node.IsLp() ? "GROUP" : ToStd(node.GetTypeName());
}

std::string TreeList::Token(size_t index) const
{
    const Node& node = AsNode(m_nodes[index]);
    return node.IsLp() ? "( )" : ToStd(node.GetToken());
}

std::string TreeList::Label(size_t index) const
{
    const Node& node = AsNode(m_nodes[index]);
    const std::string token = Visible(Token(index));
    return node.IsId() || node.IsConst() ? token : TypeName(index) + "  " + token;
}

bool TreeList::IsName(size_t index) const
{
    return AsNode(m_nodes[index]).IsId();
}

void PutDot(const TreeList& list, const std::function<void(const std::string&)>& put)
{
    put("digraph equation {\n  node [shape=box, fontname=\"monospace\"];\n");
    for (size_t index = 0; index < list.Entries().size(); ++index) {
        const TreeList::Entry& entry = list.Entries()[index];
        const std::string name = "n" + std::to_string(index);
        put("  " + name + " [label=" + DotString(list.Label(index)) +
            (list.IsName(index) ? ", shape=ellipse];\n" : "];\n"));
        if (entry.parent != TreeList::kNoNode)
            put("  n" + std::to_string(entry.parent) + " -> " + name + ";\n");
    }
    put("}\n");
}

} // namespace booleq
