// The node store: the nodes of one equation, shared by all engine objects that are copies; and the
// tokens that nodes are made of.
#ifndef KQ_BOOLEQUATIONIMPSTORE_H
#define KQ_BOOLEQUATIONIMPSTORE_H

#include <algorithm>
#include <cassert>
#include <cstring>
#include <new>
#include <vector>

#include <Kq_BoolEquationImpNode.h>

#include "Kq_BoolEquationImpProgram.h"

// Equal in length and bytes; a NUL byte is a byte like any other.
inline bool KqIsSameText(const Port::StringBase<char>& left, const Port::StringBase<char>& right)
{
    return left.length() == right.length() &&
           std::memcmp(left.c_str(), right.c_str(), left.length()) == 0;
}

// The tokens of one text, in text order. The first ones need no heap.
// Texts point into the pool of names and the table of spellings: they outlive every equation.
class Kq_BoolEquationImp::Tokens {
  public:
    struct Token {
        Node::TYPE type;
        const Port::StringBase<char>* text;
    };

    size_t GetSize() const { return m_size; }
    const Token* begin() const { return m_size <= kInline ? m_first : m_all.data(); }
    const Token* end() const { return begin() + m_size; }

    // Few texts have more tokens than every second character starts one: room for so many is made
    // at once, as growing a long list costs more than memory that is never touched.
    explicit Tokens(size_t textLength) : m_expected_size(std::min(textLength / 2, kMaxExpected)) {}

    void Append(Node::TYPE type, const Port::StringBase<char>& text)
    {
        const Token token = {type, &text};
        if (m_size < kInline) {
            m_first[m_size] = token;
        } else {
            if (m_size == kInline)
                Spill();
            m_all.push_back(token);
        }
        ++m_size;
    }

  private:
    static constexpr size_t kInline = 128;
    // A text may be blanks for the most part, so the guess is worth 16 MB at most.
    static constexpr size_t kMaxExpected = size_t(1) << 20;

    void Spill()
    {
        m_all.reserve(std::max(m_expected_size, 2 * kInline));
        m_all.assign(m_first, m_first + kInline);
    }

    size_t m_expected_size;
    size_t m_size = 0;
    Token m_first[kInline];
    std::vector<Token> m_all; // all tokens, once they are too many for m_first
};

// Invariants:
// 1. m_count is the number of engine objects that point here; the last one to leave deletes.
// 2. All nodes lie side by side in one block from the node class's allocator, in the order they
//    were made. m_nodes lists every one of them once, and owns none.
// 3. m_root is null until the whole tree has passed its checks. From the end of SetEquation on the
//    list is the tree in pre-order.
// 4. m_compiled is made of the nodes and their variable indices, and goes when they change.
struct Kq_BoolEquationImp::Store {
    Store() = default;
    ~Store() { FreeNodes(); }
    Store(const Store&) = delete;
    Store& operator=(const Store&) = delete;

    // Makes a node of each token and leaves room for one more.
    // Requires: no nodes.  Fails: std::bad_alloc; the nodes made so far are listed.
    void MakeNodes(const Tokens& tokens);

    // Requires: fewer nodes than MakeNodes left room for.
    Node* MakeNode(Node::TYPE type, const Port::StringBase<char>& text)
    {
        assert(m_nodes.size() < m_num_slots);
        Node* node = ::new (static_cast<void*>(m_block + m_nodes.size())) Node(type, text);
        m_nodes.push_back(node);
        return node;
    }

    // Lists the tree in pre-order.
    // Requires: a checked tree of all nodes.  Fails: std::bad_alloc, with the order as it was made.
    void ListInPreOrder();

    void FreeNodes() noexcept;

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

    Node* m_block = nullptr;
    size_t m_num_slots = 0;
    KqCompiled m_compiled;
};

// Asserts invariant 3 and that links agree, for the builds that check: every node stands at the
// place that pre-order gives it, and its parent has it as a child. A NOT's parent link may differ:
// that of the top NOT of a negated operator inside something stays at the operator's first operand.
void KqCheckStore(const Kq_BoolEquationImp::Store& store);

#endif
