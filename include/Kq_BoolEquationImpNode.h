// The nodes of an equation. Use Kq_BoolEquation.h unless you read the tree itself.
//     const Kq_BoolEquation equation("A & ~B");
//     if (!equation) return 1; // refused
//     const Kq_BoolEquationImp::Node* const root = equation.GetImp()->GetRoot();
//     std::cout << root->GetTypeName().c_str() << '\n'; // AND
//     std::cout << root->GetLeftChild()->GetToken().c_str() << '\n'; // A
//     std::cout << root->GetRightChild()->GetTypeName().c_str() << '\n'; // NOT
// The accessors are in the header because every step of the library goes through them.

#ifndef KQ_BOOLEQUATIONIMPNODE_H
#define KQ_BOOLEQUATIONIMPNODE_H

#include <atomic>

#include <Kq_BoolEquationImp.h>

// One node of an equation: first a token of the text, later an element of its tree.
// Links between nodes own nothing; the equation's node store owns the nodes.
// Shapes in a built tree:
// 1. A binary operator has its first operand left and its second right.
// 2. NOT and TRUTH_TABLE have their operand left and nothing right.
// 3. A group is an LP with the enclosed expression left (null for "()") and its RP right.
// 4. ID, ZERO, ONE and RP are leaves.
// 5. A node's parent has it as a child, except the top NOT of a negated operator inside something
//    ("P & X ~ | Y"): that link deliberately stays at the operator's first operand X.
class KQ_EXPORT Kq_BoolEquationImp::Node {
  public:
    // What a node is; the numbers are fixed.
    enum TYPE : unsigned int {
        AND = 0,          // binary operator: both
        ZERO = 1,         // the constant 0
        ONE = 2,          // the constant 1
        ID = 3,           // a variable
        LP = 4,           // a group, by its opening parenthesis
        NAND = 5,         // binary operator: not both
        NOR = 6,          // binary operator: none
        NOT = 7,          // the operand inverted
        NXOR = 8,         // binary operator: both alike
        OR = 9,           // binary operator: one or both
        RP = 10,          // the closing parenthesis of a group
        TRUTH_TABLE = 11, // root over the expression that an init value stands for
        XOR = 12,         // binary operator: one, not both
        SENTINEL = 13     // nothing; never part of an equation
    };

    // A SENTINEL with an empty token and no links.
    Node()
        : m_type(SENTINEL), m_parent(nullptr), m_left_child(nullptr), m_right_child(nullptr),
          m_value(0)
    {
    }
    // No links, value 0.
    Node(TYPE type, const Port::StringBase<char>& token)
        : m_type(type), m_token(token), m_parent(nullptr), m_left_child(nullptr),
          m_right_child(nullptr), m_value(0)
    {
    }
    // Links are copied as they are: the copy points at the same parent and children.
    Node(const Node& other)
        : m_type(other.m_type), m_token(other.m_token), m_parent(other.m_parent),
          m_left_child(other.m_left_child), m_right_child(other.m_right_child),
          m_value(other.GetValue())
    {
    }
    ~Node() = default; // other nodes stay as they are
    Node& operator=(const Node& other)
    {
        m_token = other.m_token; // all that can fail comes first
        m_type = other.m_type;
        m_parent = other.m_parent;
        m_left_child = other.m_left_child;
        m_right_child = other.m_right_child;
        SetValue(other.GetValue());
        return *this;
    }

    void SetType(TYPE type) { m_type = type; } // the type alone
    TYPE GetType() const { return m_type; }    // the type as set, even a corrupt one
    // The token as it was parsed: an operator's spelling, an ID's name, an init value as given.
    void SetToken(const Port::StringBase<char>& token) { m_token = token; }
    const Port::StringBase<char>& GetToken() const { return m_token; }
    // Links to other nodes, null where there is none. Setting one changes no other.
    void SetParent(Node* parent) { m_parent = parent; }
    Node* GetParent() const { return m_parent; }
    void SetLeftChild(Node* leftChild) { m_left_child = leftChild; }
    Node* GetLeftChild() const { return m_left_child; }
    void SetRightChild(Node* rightChild) { m_right_child = rightChild; }
    Node* GetRightChild() const { return m_right_child; }
    // An ID's variable index, counted from 0; no meaning for other types.
    // Threads: both at any time, as copies of an equation may link the nodes that they share.
    void SetValue(unsigned int value) { m_value.store(value, std::memory_order_relaxed); }
    unsigned int GetValue() const { return m_value.load(std::memory_order_relaxed); }

    // Whether the node has this type, or one of these types.
    bool Is0() const { return m_type == ZERO; }
    bool Is1() const { return m_type == ONE; }
    bool IsConst() const { return Is0() || Is1(); }
    bool IsLp() const { return m_type == LP; }
    bool IsRp() const { return m_type == RP; }
    bool IsId() const { return m_type == ID; }
    bool IsNot() const { return m_type == NOT; }
    bool IsAnd() const { return m_type == AND; }
    bool IsOr() const { return m_type == OR; }
    bool IsXor() const { return m_type == XOR; }
    bool IsNAnd() const { return m_type == NAND; }
    bool IsNOr() const { return m_type == NOR; }
    bool IsNXor() const { return m_type == NXOR; }
    // Deliberate: anything but LP, RP, ID, NOT and SENTINEL, so constants, TRUTH_TABLE and corrupt
    // types give true.
    bool IsBinOp() const { return !IsLp() && !IsRp() && !IsId() && !IsNot() && m_type != SENTINEL; }

    // The node that parent links lead up to. Where they run in a circle (shape 5), the first node
    // on the way that is not a child of its parent.
    Node* GetTopParent() const;

    // "AND", "0", "ID", ...; "UNKNOWN" for a corrupt type. Valid until unload, like all spellings.
    const Port::StringBase<char>& GetTypeName() const;
    // The type's spelling in syntax 1 (&), 2 (*) and 3 (.AND.); the node's own token for ID and
    // TRUTH_TABLE, "?" for a SENTINEL, "??" for a corrupt type.
    const Port::StringBase<char>& GetTokenAlt1() const;
    const Port::StringBase<char>& GetTokenAlt2() const;
    const Port::StringBase<char>& GetTokenAlt3() const;

    // Whether the type, which links are null and, for ID and TRUTH_TABLE, the token agree or
    // differ.
    bool operator==(const Node& other) const;
    bool operator!=(const Node& other) const;

    // The value of the subtree for a table whose entry k holds variable k's value.
    // Deliberate: values are not forced to 0 or 1. AND and OR combine all bits, the other
    // operators compare whole values and give 0 or 1. An index beyond the table, a missing child,
    // an RP and a SENTINEL count as 0. Every operand is evaluated, the left one first.
    // Cost: O(nodes), no recursion.
    unsigned int
    Eval(const std::vector<std::pair<Port::StringBase<char>, unsigned int>>& variables) const;

    // Writes the subtree to the message manager, one line for each node.
    void Dbg() const;

    // A request for the size of a Node goes to the class allocator, any other size to mav_malloc.
    // Fails: std::bad_alloc.
    static void* operator new(size_t size);
    static void operator delete(void* memory, size_t size);

    static std::allocator<Node> m_kq_boolequationimp_node_mem; // serves operator new

  private:
    friend class Kq_BoolEquationImp;

    // Dbg for the node that broke a build; bounded, because a whole text can hang below it.
    void DbgFailure() const;
    void DbgLine(int depth) const;
    size_t CountDbgBytes(int depth) const;
    void Dbg(int depth) const;
    void DbgName(Port::StringBase<char>& name) const;
    void DbgPrefix(int numPieces) const;

    TYPE m_type;
    Port::StringBase<char> m_token;
    Node* m_parent;
    Node* m_left_child;
    Node* m_right_child;
    std::atomic<unsigned int> m_value;
};

#endif
