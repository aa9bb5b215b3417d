// Walks over a tree of nodes without recursion: the depth of a tree is the text's to choose, the
// stack is the host's. A stack keeps its first entries in place, so ordinary walks allocate
// nothing.
#ifndef KQ_BOOLEQUATIONIMPWALK_H
#define KQ_BOOLEQUATIONIMPWALK_H

#include <cassert>
#include <cstddef>
#include <type_traits>
#include <vector>

#include <Kq_BoolEquationImpNode.h>

// A last-in first-out stack of plain values; the first kInline of them need no heap.
// Requires: Pop and Top on a stack that is not empty.  Fails: std::bad_alloc from Push.
template <class Entry, size_t kInline>
class KqStack {
    static_assert(std::is_trivially_copyable<Entry>::value, "entries are plain values");

  public:
    bool IsEmpty() const { return m_size == 0; }

    void Push(const Entry& entry)
    {
        if (m_size < kInline)
            m_first[m_size] = entry;
        else
            m_rest.push_back(entry);
        ++m_size;
    }

    Entry Pop()
    {
        assert(m_size > 0);
        --m_size;
        if (m_size < kInline)
            return m_first[m_size];
        const Entry entry = m_rest.back();
        m_rest.pop_back();
        return entry;
    }

    Entry& Top()
    {
        assert(m_size > 0);
        return m_size <= kInline ? m_first[m_size - 1] : m_rest.back();
    }

  private:
    size_t m_size = 0;
    Entry m_first[kInline];
    std::vector<Entry> m_rest;
};

// Calls visit(node, depth) for 'root' at 'depth' and every node below it: a node, its whole left
// subtree, its right subtree. 'visit' returns false to end the walk; NodePtr is a pointer to a
// const or a plain node.
// Requires: child links that form a tree, as a builder's links always do.
template <class NodePtr, class Visit>
void KqWalkPreOrder(NodePtr root, size_t depth, Visit visit)
{
    struct Entry {
        NodePtr node;
        size_t depth;
    };
    KqStack<Entry, 32> pending;
    pending.Push({root, depth});
    while (!pending.IsEmpty()) {
        const Entry entry = pending.Pop();
        if (!visit(entry.node, entry.depth))
            return;
        // The right child is pushed first, so the left one is visited first.
        if (entry.node->GetRightChild())
            pending.Push({entry.node->GetRightChild(), entry.depth + 1});
        if (entry.node->GetLeftChild())
            pending.Push({entry.node->GetLeftChild(), entry.depth + 1});
    }
}

#endif
