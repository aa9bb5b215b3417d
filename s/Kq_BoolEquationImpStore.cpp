// The node store: nodes made in one block, listed in the order asked for, freed together.
// Fails: std::bad_alloc, with the nodes made so far listed.
#include "Kq_BoolEquationImpStore.h"

#include <cerrno>

#if defined(__linux__)
#include <sys/mman.h>
#endif

#include "Kq_BoolEquationImpWalk.h"

typedef Kq_BoolEquationImp::Node Node;
typedef Kq_BoolEquationImp::Store Store;

namespace {

constexpr size_t kKeptSlots = 3000;

// Asks for large pages for a block of several megabytes that is about to be filled. A hint to the
// system where there is one, and nothing elsewhere; docs/benchmarks.md says what it saves.
void AdviseLargePages(void* block, size_t size)
{
#if defined(__linux__)
    constexpr uintptr_t kPage = 2u << 20;
    const uintptr_t begin = (reinterpret_cast<uintptr_t>(block) + kPage - 1) / kPage * kPage;
    const uintptr_t end = (reinterpret_cast<uintptr_t>(block) + size) / kPage * kPage;
    const int savedErrno = errno;
    if (end > begin + kPage)
        madvise(reinterpret_cast<void*>(begin), end - begin, MADV_HUGEPAGE);
    errno = savedErrno;
#else
    (void)block;
    (void)size;
#endif
}

} // namespace

void Store::MakeNodes(const Tokens& tokens)
{
    assert(m_nodes.empty());
    FreeNodes(); // an allocation that failed before may have left a block without nodes
    m_nodes.reserve(tokens.GetSize() + 1);
    m_block = Node::m_kq_boolequationimp_node_mem.allocate(tokens.GetSize() + 1);
    m_num_slots = tokens.GetSize() + 1;
    AdviseLargePages(m_block, m_num_slots * sizeof(Node));
    for (const Tokens::Token& token : tokens)
        MakeNode(token.type, *token.text);
}

void Store::ListInPreOrder()
{
    KqStack<Node*, 32> pending;
    pending.Push(m_root);
    try {
        for (Node*& position : m_nodes) {
            Node* node = pending.Pop();
            position = node;
            // The right child is pushed first, so the left one is listed first.
            if (node->GetRightChild())
                pending.Push(node->GetRightChild());
            if (node->GetLeftChild())
                pending.Push(node->GetLeftChild());
        }
    } catch (...) {
        for (size_t position = 0; position < m_nodes.size(); ++position)
            m_nodes[position] = m_block + position;
        throw;
    }
}

void Store::FreeNodes() noexcept
{
    m_root = nullptr;
    m_compiled.Drop();
    for (size_t position = 0; position < m_nodes.size(); ++position)
        m_block[position].~Node();
    m_nodes.clear();
    // The list of an ordinary equation is kept for the next one, a long one is given back.
    if (m_nodes.capacity() > kKeptSlots)
        std::vector<Node*>().swap(m_nodes);
    if (m_block)
        Node::m_kq_boolequationimp_node_mem.deallocate(m_block, m_num_slots);
    m_block = nullptr;
}

void KqCheckStore(const Kq_BoolEquationImp::Store& store)
{
#ifdef NDEBUG
    (void)store;
#else
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
