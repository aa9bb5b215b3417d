// The node dump: a subtree as indented lines through the message manager, each line made of several
// messages. Only reads. Depth costs memory for the pending nodes and output for the indentation.
#include <Kq_BoolEquationImpNode.h>

#include <cstdint>
#include <string>

#include "Kq_BoolEquationImpDiag.h"
#include "Kq_BoolEquationImpWalk.h"

typedef Kq_BoolEquationImp::Node Node;
typedef Port::StringBase<char> String;

namespace {

// Node dumps carry fixed numbers; they name no line of this file.
constexpr int kPrefixLine = 487;
constexpr int kLeftLine = 503;
constexpr int kRightLine = 508;
constexpr int kNodeLine = 512;

// A text of 16 kB that does not build could otherwise cost a hundred million messages.
constexpr size_t kMaxFailureNodes = 256;

} // namespace

void Node::Dbg() const
{
    Dbg(0);
}

void Node::Dbg(int depth) const
{
    DbgLines(depth, SIZE_MAX);
}

void Node::DbgFailure() const
{
    DbgLines(0, kMaxFailureNodes);
}

// Dumps this node and what is below it, at most 'maxNodes' nodes; says so when there are more.
void Node::DbgLines(int depth, size_t maxNodes) const
{
    size_t numNodes = 0;
    KqWalkPreOrder(this, static_cast<size_t>(depth), [&](const Node* node, size_t nodeDepth) {
        if (numNodes == maxNodes) {
            KQ_EMIT(kKqNodeModule, kNodeLine, "NODE: ...\n");
            return false;
        }
        ++numNodes;
        node->DbgLine(static_cast<int>(nodeDepth));
        return true;
    });
}

// Dumps this node alone: which child it is, then its line.
void Node::DbgLine(int depth) const
{
    String name;
    DbgName(name);
    String parentName;
    if (m_parent)
        m_parent->DbgName(parentName);
    if (m_parent && m_parent->m_left_child == this) {
        DbgPrefix(depth - 1);
        KQ_EMIT(kKqNodeModule, kLeftLine, "LEFT:\n");
    } else if (m_parent && m_parent->m_right_child == this) {
        DbgPrefix(depth - 1);
        KQ_EMIT(kKqNodeModule, kRightLine, "RIGHT:\n");
    }
    DbgPrefix(depth);
    KQ_EMIT(kKqNodeModule, kNodeLine, "NODE: %s parent=%s type=%s token=%s val=%d\n", name.c_str(),
            parentName.c_str(), GetTypeName().c_str(), m_token.c_str(), static_cast<int>(m_value));
}

// Puts this node's path in front of 'name': "TOP." and an L or R for each step down.
// A node that its parent does not have ends the path there, without "TOP.": so the walk ends even
// where the parent link of a negated operator's NOT closes a circle.
void Node::DbgName(String& name) const
{
    std::string steps;
    const Node* node = this;
    for (; node->m_parent; node = node->m_parent) {
        if (node->m_parent->m_left_child == node)
            steps += 'L';
        else if (node->m_parent->m_right_child == node)
            steps += 'R';
        else
            break;
    }
    const std::string path(steps.rbegin(), steps.rend());
    String result = node->m_parent ? "" : "TOP.";
    result += path.c_str();
    result += name;
    name = result;
}

void Node::DbgPrefix(int numPieces) const
{
    for (int piece = 0; piece < numPieces; ++piece)
        KQ_EMIT(kKqNodeModule, kPrefixLine, "  ");
}
