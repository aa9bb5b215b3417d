// Tokens in, nodes out: made in one block, listed in the order asked for, freed together.
// Fails: std::bad_alloc, and what was made is freed with the tree.
#include "Tree.h"

#include <cerrno>
#include <cstdint>
#include <new>
#include <utility>

#if defined(__linux__)
#include <sys/mman.h>
#endif

#include "Tokens.h"
#include "Walk.h"

typedef Kq_BoolEquationImp::Node Node;
typedef Port::StringBase<char> String;

namespace {

// Asks for large pages for a block of several megabytes that is about to be filled. Only a hint,
// and only on Linux; docs/benchmarks.md says what it saves.
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

// Puts the nodes into a list, each before those below it.
struct Lister : KqPreOrder {
    unsigned int Enter(Node* node, Node*& left, Node*& right)
    {
        assert(position != end);
        *position++ = node;
        left = node->GetLeftChild();
        right = node->GetRightChild();
        if (!right)
            return left ? KQ_ONE : KQ_NONE;
        __builtin_prefetch(right); // far away in a text nested to the left
        if (left)
            return KQ_BOTH;
        left = right;
        return KQ_ONE;
    }

    Node** position;
    Node** end;
};

struct Pair {
    const Node* left;
    const Node* right;
};

struct Comparer : KqPreOrder {
    unsigned int Enter(const Pair& pair, Pair& first, Pair& second)
    {
        if (!pair.left && !pair.right)
            return KQ_NONE;
        if (!pair.left || !pair.right || *pair.left != *pair.right) {
            isSame = false;
            return KQ_END;
        }
        first = {pair.left->GetLeftChild(), pair.right->GetLeftChild()};
        second = {pair.left->GetRightChild(), pair.right->GetRightChild()};
        return KQ_BOTH;
    }

    bool isSame = true;
};

#ifndef NDEBUG
struct Checker : KqPreOrder {
    unsigned int Enter(const Node* node, const Node*& left, const Node*& right)
    {
        assert(position < list->size());
        assert((*list)[position] == node);
        ++position;
        left = node->GetLeftChild();
        right = node->GetRightChild();
        assert(!left || left->GetParent() == node || left->IsNot());
        assert(!right || right->GetParent() == node || right->IsNot());
        if (left && right)
            return KQ_BOTH;
        left = left ? left : right;
        return left ? KQ_ONE : KQ_NONE;
    }

    const std::vector<Node*>* list;
    size_t position = 0;
};
#endif

} // namespace

void KqNodeBlock::Allocate(size_t numNodes)
{
    assert(m_size == 0);
    Free(); // an earlier failed allocation may have left a block without nodes
    m_nodes = Node::m_kq_boolequationimp_node_mem.allocate(numNodes);
    m_num_slots = numNodes;
    AdviseLargePages(m_nodes, m_num_slots * sizeof(Node));
}

void KqNodeBlock::Free() noexcept
{
    for (size_t position = 0; position < m_size; ++position)
        m_nodes[position].~Node();
    m_size = 0;
    if (m_nodes)
        Node::m_kq_boolequationimp_node_mem.deallocate(m_nodes, m_num_slots);
    m_nodes = nullptr;
    m_num_slots = 0;
}

void KqNodeBlock::Swap(KqNodeBlock& other) noexcept
{
    std::swap(m_nodes, other.m_nodes);
    std::swap(m_num_slots, other.m_num_slots);
    std::swap(m_size, other.m_size);
}

void KqTree::MakeRoom(size_t numNodes)
{
    assert(list.empty());
    list.reserve(numNodes);
    block.Allocate(numNodes);
}

void KqTree::MakeNodes(const KqTokens& tokens)
{
    MakeRoom(tokens.GetSize() + 1);
    // Sized at once: 100 tokens take 2.15 us, and 2.28 us with a list that grows node by node.
    list.resize(tokens.GetSize());
    Node** position = list.data();
    for (const KqTokens::Token& token : tokens)
        *position++ = block.Make(token.type, token.word->text);
}

void KqTree::AddTruthTableRoot(const String& initValue)
{
    Node* const table = MakeNode(Node::TRUTH_TABLE, initValue);
    table->SetLeftChild(root);
    root->SetParent(table);
    root = table;
}

void KqTree::ListInPreOrder()
{
    Lister lister;
    lister.position = list.data();
    lister.end = list.data() + list.size();
    KqWalk(root, lister);
    assert(lister.position == lister.end);
}

bool KqIsSameTree(const Node* left, const Node* right)
{
    Comparer comparer;
    KqWalk(Pair{left, right}, comparer);
    return comparer.isSame;
}

void KqCheckTree(const Node* root, const std::vector<Node*>& list)
{
#ifdef NDEBUG
    (void)root;
    (void)list;
#else
    Checker checker;
    checker.list = &list;
    if (root)
        KqWalk(root, checker);
    assert(checker.position == list.size());
#endif
}
