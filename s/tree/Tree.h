// The nodes of one equation: a block of memory that holds them, the list of them, and the root.
#ifndef KQ_TREE_H
#define KQ_TREE_H

#include <cassert>
#include <vector>

#include <Kq_BoolEquationImpNode.h>

class KqTokens;

// Memory for nodes, side by side in the order in which they are made, from the node class's
// allocator.
// Invariant: the first m_size slots hold nodes, which are destroyed with the block.
class KqNodeBlock {
  public:
    typedef Kq_BoolEquationImp::Node Node;

    KqNodeBlock() = default;
    ~KqNodeBlock() { Free(); }
    KqNodeBlock(const KqNodeBlock&) = delete;
    KqNodeBlock& operator=(const KqNodeBlock&) = delete;

    // Makes room for this many nodes.  Requires: none so far.  Fails: std::bad_alloc.
    void Allocate(size_t numNodes);

    // Requires: room.  Fails: std::bad_alloc, and no node is made.
    Node* Make(Node::TYPE type, const Port::StringBase<char>& text)
    {
        assert(m_size < m_num_slots);
        Node* const node = ::new (static_cast<void*>(m_nodes + m_size)) Node(type, text);
        ++m_size;
        return node;
    }

    void Free() noexcept;
    void Swap(KqNodeBlock& other) noexcept;

  private:
    Node* m_nodes = nullptr;
    size_t m_num_slots = 0;
    size_t m_size = 0;
};

// A root, the list of all nodes, and their block, built apart from any equation and then handed
// whole to its store. No message receiver knows of it, and a failure leaves no trace.
struct KqTree {
    typedef Kq_BoolEquationImp::Node Node;

    // Makes one node for each token, in their order, and leaves room for one more.
    // Fails: std::bad_alloc.
    void MakeNodes(const KqTokens& tokens);
    // Makes room, then nodes one by one.  Requires: no nodes so far; room.
    void MakeRoom(size_t numNodes);
    Node* MakeNode(Node::TYPE type, const Port::StringBase<char>& text)
    {
        assert(list.size() < list.capacity());
        Node* const node = block.Make(type, text);
        list.push_back(node);
        return node;
    }
    // Puts an init value's own root above the tree.
    // Requires: a root; room.
    void AddTruthTableRoot(const Port::StringBase<char>& initValue);
    // Lists the tree in pre-order.
    // Requires: a checked tree of all nodes.  Fails: std::bad_alloc, with the list in no set order.
    void ListInPreOrder();

    Node* root = nullptr;
    std::vector<Node*> list; // owns none
    KqNodeBlock block;
};

// Whether the trees at 'left' and 'right', either of which may be null, have equal nodes.
// Fails: std::bad_alloc.
bool KqIsSameTree(const Kq_BoolEquationImp::Node* left, const Kq_BoolEquationImp::Node* right);

// In builds with assertions, checks that the list is the tree at 'root' in pre-order and that links
// agree. A NOT's parent link may differ: that of the top NOT of a negated operator inside something
// stays at the operator's first operand.
void KqCheckTree(const Kq_BoolEquationImp::Node* root,
                 const std::vector<Kq_BoolEquationImp::Node*>& list);

#endif
