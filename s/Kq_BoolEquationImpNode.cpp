// The node: its fields, what its type answers, its spellings and its allocator.
#include <Kq_BoolEquationImpNode.h>

#include <new>

#include <port/mav_malloc.h>

#include "Spelling.h"

typedef Kq_BoolEquationImp::Node Node;
typedef Port::StringBase<char> String;

std::allocator<Node> Node::m_kq_boolequationimp_node_mem;

namespace {

// The node's spelling in a fixed syntax, 0 to 2.
const String& GetAlternative(const Node& node, unsigned int syntaxIndex)
{
    const String* const spelling = KqGetTypeSpelling(node.GetType(), syntaxIndex);
    return spelling ? *spelling : node.GetToken();
}

bool HasAsChild(const Node& parent, const Node& node)
{
    return parent.GetLeftChild() == &node || parent.GetRightChild() == &node;
}

} // namespace

Node* Node::GetTopParent() const
{
    // The mark moves up to the walker whenever the distance has doubled, so a walker that runs in a
    // circle meets it, and the walk ends after a few times the length of the path.
    const Node* node = this;
    const Node* mark = this;
    size_t numSteps = 0;
    size_t nextMark = 1;
    while (node->m_parent) {
        node = node->m_parent;
        ++numSteps;
        if (node == mark)
            break;
        if (numSteps == nextMark) {
            mark = node;
            nextMark *= 2;
        }
    }
    if (!node->m_parent)
        return const_cast<Node*>(node);
    // A circle: finds the first node that is not a child of its parent. The bound is for circles of
    // correct links, which no builder makes.
    node = this;
    while (numSteps-- > 0 && HasAsChild(*node->m_parent, *node))
        node = node->m_parent;
    return const_cast<Node*>(node);
}

const String& Node::GetTypeName() const
{
    return KqGetTypeName(m_type);
}

const String& Node::GetTokenAlt1() const
{
    return GetAlternative(*this, 0);
}

const String& Node::GetTokenAlt2() const
{
    return GetAlternative(*this, 1);
}

const String& Node::GetTokenAlt3() const
{
    return GetAlternative(*this, 2);
}

bool Node::operator==(const Node& other) const
{
    if (m_type != other.m_type)
        return false;
    // Only whether links are present counts, never what they point at.
    if (!m_left_child != !other.m_left_child || !m_right_child != !other.m_right_child ||
        !m_parent != !other.m_parent)
        return false;
    if (m_type != ID && m_type != TRUTH_TABLE)
        return true;
    return KqIsSameText(m_token, other.m_token);
}

bool Node::operator!=(const Node& other) const
{
    return !(*this == other);
}

void* Node::operator new(size_t size)
{
    if (size == sizeof(Node))
        return m_kq_boolequationimp_node_mem.allocate(1);
    void* memory = mav_malloc(size);
    if (!memory)
        throw std::bad_alloc();
    return memory;
}

void Node::operator delete(void* memory, size_t size)
{
    if (size != sizeof(Node))
        mav_free(memory);
    else if (memory)
        m_kq_boolequationimp_node_mem.deallocate(static_cast<Node*>(memory), 1);
}
