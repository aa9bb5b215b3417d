// The node dump: writes a subtree as indented lines to the message manager, several messages to a
// line. Only reads. Depth costs memory for the pending nodes and output for the indentation.
#include <Kq_BoolEquationImpNode.h>

#include <cstring>
#include <string>

#include "Messages.h"
#include "Walk.h"

typedef Kq_BoolEquationImp::Node Node;
typedef Port::StringBase<char> String;

namespace {

// Node dumps carry fixed line numbers, which are not lines of this file.
constexpr int kPrefixLine = 487;
constexpr int kLeftLine = 503;
constexpr int kRightLine = 508;
constexpr int kNodeLine = 512;

// The dump of a node that broke a build ends after this many node lines or before this many bytes:
// otherwise a 16 kB text that does not build could cost a hundred million messages.
constexpr size_t kMaxFailureNodes = 256;
constexpr size_t kMaxFailureBytes = size_t(1) << 20;

struct Place {
    const Node* node;
    int depth;
};

// Calls dump(node, depth) for each node in pre-order until it returns false.
template <class Dump>
struct Dumper : KqPreOrder {
    explicit Dumper(Dump dumpNode) : dump(dumpNode) {}

    unsigned int Enter(const Place& place, Place& left, Place& right)
    {
        if (!dump(*place.node, place.depth))
            return KQ_END;
        left = {place.node->GetLeftChild(), place.depth + 1};
        right = {place.node->GetRightChild(), place.depth + 1};
        if (left.node && right.node)
            return KQ_BOTH;
        left = left.node ? left : right;
        return left.node ? KQ_ONE : KQ_NONE;
    }

    Dump dump;
};

template <class Dump>
void DumpTree(const Node* root, int depth, Dump dump)
{
    KqWalk(Place{root, depth}, Dumper<Dump>(dump));
}

} // namespace

void Node::Dbg() const
{
    Dbg(0);
}

void Node::Dbg(int depth) const
{
    DumpTree(this, depth, [](const Node& node, int nodeDepth) {
        node.DbgLine(nodeDepth);
        return true;
    });
}

void Node::DbgFailure() const
{
    size_t numNodes = 0;
    size_t numBytes = 0;
    DumpTree(this, 0, [&](const Node& node, int depth) {
        numBytes += node.CountDbgBytes(depth);
        if (numNodes == kMaxFailureNodes || numBytes > kMaxFailureBytes) {
            KQ_EMIT(kKqNodeModule, kNodeLine, "NODE: ...\n");
            return false;
        }
        ++numNodes;
        node.DbgLine(depth);
        return true;
    });
}

// How many bytes DbgLine writes.
size_t Node::CountDbgBytes(int depth) const
{
    size_t numBytes = 2 * static_cast<size_t>(depth);
    const size_t numHeaderBlanks = 2 * static_cast<size_t>(depth > 0 ? depth - 1 : 0);
    if (m_parent && m_parent->m_left_child == this)
        numBytes += numHeaderBlanks + std::strlen("LEFT:\n");
    else if (m_parent && m_parent->m_right_child == this)
        numBytes += numHeaderBlanks + std::strlen("RIGHT:\n");
    String names;
    DbgName(names);
    if (m_parent)
        m_parent->DbgName(names);
    return numBytes + std::strlen("NODE:  parent= type= token= val=\n") + names.length() +
           GetTypeName().length() + std::strlen(m_token.c_str()) +
           std::to_string(GetValue()).length();
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
            parentName.c_str(), GetTypeName().c_str(), m_token.c_str(),
            static_cast<int>(GetValue()));
}

// Puts this node's path in front of 'name': "TOP." and an L or R for each step down.
// A node that is not a child of its parent ends the path there, without "TOP.", so the walk ends
// even where the parent link of a negated operator's NOT closes a circle.
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
