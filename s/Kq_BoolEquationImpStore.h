// The node store: the nodes of one equation, shared by all engine objects that are copies.
// The list owns the nodes; the links between them own nothing.
#ifndef KQ_BOOLEQUATIONIMPSTORE_H
#define KQ_BOOLEQUATIONIMPSTORE_H

#include <cassert>
#include <vector>

#include <Kq_BoolEquationImpNode.h>

// Invariants:
// 1. m_count is the number of engine objects that point here; the last one to leave deletes.
// 2. m_nodes owns every node it lists; none stands in it twice, none is null.
// 3. m_root is null until the whole tree has passed its checks. From the end of SetEquation on the
//    list is the tree in pre-order.
struct Kq_BoolEquationImp::Store {
    Store() = default;
    ~Store() { FreeNodes(); }
    Store(const Store&) = delete;
    Store& operator=(const Store&) = delete;

    void FreeNodes() noexcept
    {
        m_root = nullptr;
        for (Node* node : m_nodes)
            delete node;
        m_nodes.clear();
    }

    // Takes one holder away.
    static void Release(Store* store) noexcept
    {
        assert(store->m_count > 0);
        if (--store->m_count == 0)
            delete store;
    }

    Node* m_root = nullptr;
    std::vector<Node*> m_nodes;
    unsigned int m_count = 1;
};

// Asserts invariant 3 and that links agree, for the builds that check: every node stands at the
// place that pre-order gives it, and its parent has it as a child. A NOT's parent link may differ:
// that of the top NOT of a negated operator inside something stays at the operator's first operand.
inline void KqCheckStore(const Kq_BoolEquationImp::Store& store)
{
#ifdef NDEBUG
    (void)store;
#else
    typedef Kq_BoolEquationImp::Node Node;
    std::vector<const Node*> pending;
    if (store.m_root)
        pending.push_back(store.m_root);
    size_t position = 0;
    while (!pending.empty()) {
        const Node* node = pending.back();
        pending.pop_back();
        assert(position < store.m_nodes.size());
        assert(store.m_nodes[position] == node);
        ++position;
        for (const Node* child : {node->GetRightChild(), node->GetLeftChild()}) {
            if (!child)
                continue;
            assert(child->GetParent() == node || child->IsNot());
            pending.push_back(child);
        }
    }
    assert(position == store.m_nodes.size());
#endif
}

#endif
