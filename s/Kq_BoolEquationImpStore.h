// The node store: the nodes of one equation, shared by all engine objects that are copies; and the
// tokens that nodes are made of.
#ifndef KQ_BOOLEQUATIONIMPSTORE_H
#define KQ_BOOLEQUATIONIMPSTORE_H

#include <algorithm>
#include <cassert>
#include <cstring>
#include <memory>
#include <vector>

#include <Kq_BoolEquationImpNode.h>

#include "Kq_BoolEquationImpInitText.h"
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

// The tree of an equation that was read from an init value is owed at first: it is made when
// somebody asks for the root or the nodes, for all holders at once. Whoever asks for them cannot
// tell; what can be told of the digits is told without them.
//
// Invariants:
// 1. m_count is the number of engine objects that point here; the last one to leave deletes.
// 2. All nodes lie side by side in one block from the node class's allocator, in the order they
//    were made. m_nodes lists every one of them once, and owns none.
// 3. m_root is null until the whole tree has passed its checks. From the end of SetEquation on the
//    list is the tree in pre-order.
// 4. m_compiled is made of the nodes and their variable indices, and goes when they change.
// 5. The tree is owed while there is an m_init_text and no root; then there are no nodes. The
//    names of an m_init_text are the first variables of every holder.
struct Kq_BoolEquationImp::Store {
  public:
    Store() = default;
    ~Store() { Clear(); }
    Store(const Store&) = delete;
    Store& operator=(const Store&) = delete;

    // Takes one holder away.
    static void Release(Store* store) noexcept
    {
        assert(store->m_count > 0);
        if (--store->m_count == 0)
            delete store;
    }

    // Whether there are neither nodes nor a tree that is owed.
    bool IsEmpty() const { return m_nodes.empty() && !m_init_text; }
    bool HasEquation() const { return m_root || m_init_text; }

    // Make the tree when it is owed.  Fails: std::bad_alloc; the tree is owed still.
    Node* GetRoot()
    {
        EnsureTree();
        return m_root;
    }
    const std::vector<Node*>& GetNodes()
    {
        EnsureTree();
        return m_nodes;
    }

    // Makes a node of each token and leaves room for one more.
    // Requires: no nodes.  Fails: std::bad_alloc; the nodes made so far are listed.
    void MakeNodes(const Tokens& tokens);
    void SetRoot(Node* root) { m_root = root; }
    // Puts the init value's own root above the tree.
    void AddTruthTableRoot(const Port::StringBase<char>& initValue);
    // Lists the tree in pre-order.
    // Requires: a checked tree of all nodes.  Fails: std::bad_alloc; then the list is good for
    // Clear only.
    void ListInPreOrder();

    // Takes an init value whose tree is owed from now on.
    // Requires: an empty store; a value whose results are its expression's.
    void Owe(std::unique_ptr<KqInitText> initText) noexcept;

    void Clear() noexcept;

    // The text of an equation that is an init value, null for any other.
    const Port::StringBase<char>* GetInitValue() const;

    // Whether both are of the same nodes.
    bool IsSame(Store& other);

    // Writes a new variable's index into the ID nodes of its name.
    void LinkVariable(const Port::StringBase<char>& name, unsigned int variableIndex);
    // The variable's index, then the position of every node whose token is the name.
    std::vector<unsigned int> MakeHandle(const Port::StringBase<char>& name,
                                         unsigned int variableIndex) const;

    // The equation's value for a table of values 0 or 1; 0 without an equation.
    // Fails: std::bad_alloc.
    unsigned int Eval(const std::vector<Variable>& variables)
    {
        if (m_compiled.HasWord(variables.size()))
            return m_compiled.EvalWord(variables);
        return EvalOther(variables);
    }
    // The column of up to six variables, repeated up to the word's end.
    // Requires: an equation.
    uint64_t GetWord(unsigned int numVariables);
    // The results as read, null for an equation that was not read from digits.
    const KqInitText* GetInitText() const { return m_init_text.get(); }

    unsigned int m_count = 1;

  private:
    Node* MakeNode(Node::TYPE type, const Port::StringBase<char>& text);
    void MakeRoom(size_t numNodes);
    void FreeNodes() noexcept;
    void EnsureTree()
    {
        if (!m_root && m_init_text)
            MakeInitTree();
    }
    void MakeInitTree();
    Node* MakeInitTerm(uint64_t row);
    void AppendInitPositions(const Port::StringBase<char>& name,
                             std::vector<unsigned int>& positions) const;
    unsigned int EvalOther(const std::vector<Variable>& variables);

    class Chain;

    Node* m_root = nullptr;
    std::vector<Node*> m_nodes;
    Node* m_block = nullptr;
    size_t m_num_slots = 0;
    KqCompiled m_compiled;
    std::unique_ptr<KqInitText> m_init_text;
};

// Asserts invariant 3 and that links agree, for the builds that check: every node stands at the
// place that pre-order gives it, and its parent has it as a child. A NOT's parent link may differ:
// that of the top NOT of a negated operator inside something stays at the operator's first operand.
void KqCheckStore(Kq_BoolEquationImp::Store& store);

#endif
