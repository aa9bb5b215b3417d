// One node of an equation: a token of the text first, an element of its tree later.
// Links between nodes own nothing; the equation's node store owns the nodes.
#ifndef KQ_BOOLEQUATIONIMPNODE_H
#define KQ_BOOLEQUATIONIMPNODE_H

#include <Kq_BoolEquationImp.h>

// Shapes in a built tree:
// 1. A binary operator has its first operand left and its second right.
// 2. NOT and TRUTH_TABLE have their operand left and nothing right.
// 3. A group is an LP with the enclosed expression left (null for "()") and its RP right.
// 4. ID, ZERO, ONE and RP are leaves.
// 5. A node's parent has it as a child, but for the top NOT of a negated operator inside something
//    ("P & X ~ | Y"): that link deliberately stays at the operator's first operand X.
class KQ_EXPORT Kq_BoolEquationImp::Node {
  public:
    // The numbers are fixed.
    enum TYPE : unsigned int {
        AND = 0,
        ZERO = 1,
        ONE = 2,
        ID = 3,
        LP = 4,
        NAND = 5,
        NOR = 6,
        NOT = 7,
        NXOR = 8,
        OR = 9,
        RP = 10,
        TRUTH_TABLE = 11,
        XOR = 12,
        SENTINEL = 13
    };

    // A SENTINEL with an empty token and no links.
    Node();
    Node(TYPE type, const Port::StringBase<char>& token);
    // Copies the links too: the copy points at the same parent and children.
    Node(const Node& other);
    ~Node();
    Node& operator=(const Node& other);

    void SetType(TYPE type);
    TYPE GetType() const;
    void SetToken(const Port::StringBase<char>& token);
    // The token as it was parsed; an ID's name.
    const Port::StringBase<char>& GetToken() const;
    void SetParent(Node* parent);
    Node* GetParent() const;
    void SetLeftChild(Node* leftChild);
    Node* GetLeftChild() const;
    void SetRightChild(Node* rightChild);
    Node* GetRightChild() const;
    // An ID's variable index; no meaning for other types.
    void SetValue(unsigned int value);
    unsigned int GetValue() const;

    bool Is0() const;
    bool Is1() const;
    bool IsConst() const;
    bool IsLp() const;
    bool IsRp() const;
    bool IsId() const;
    bool IsNot() const;
    bool IsAnd() const;
    bool IsOr() const;
    bool IsXor() const;
    bool IsNAnd() const;
    bool IsNOr() const;
    bool IsNXor() const;
    // Deliberate: anything but LP, RP, ID, NOT and SENTINEL, so constants, TRUTH_TABLE and corrupt
    // types answer true.
    bool IsBinOp() const;

    // The node that parent links lead to. Where they run in a circle (shape 5), the first node on
    // the way whose parent has it as neither child.
    Node* GetTopParent() const;

    // "AND", "0", "ID", ...; "UNKNOWN" for a corrupt type. Valid until unload, like all spellings.
    const Port::StringBase<char>& GetTypeName() const;
    // The type's spelling in syntax 1 (&), 2 (*) and 3 (.AND.); the own token for ID and
    // TRUTH_TABLE, "?" for a SENTINEL, "??" for a corrupt type.
    const Port::StringBase<char>& GetTokenAlt1() const;
    const Port::StringBase<char>& GetTokenAlt2() const;
    const Port::StringBase<char>& GetTokenAlt3() const;

    // Same type, links present in the same places, and for ID and TRUTH_TABLE the same token.
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

    // Exactly the size of a Node comes from the class allocator, another size from mav_malloc.
    // Fails: std::bad_alloc.
    static void* operator new(size_t size);
    static void operator delete(void* memory, size_t size);

    static std::allocator<Node> m_kq_boolequationimp_node_mem;

  private:
    friend class Kq_BoolEquationImp;

    // Dbg for the node that broke a build: bounded, as a whole text can hang below it.
    void DbgFailure() const;
    void DbgLines(int depth, size_t maxNodes) const;
    void DbgLine(int depth) const;
    void Dbg(int depth) const;
    void DbgName(Port::StringBase<char>& name) const;
    void DbgPrefix(int numPieces) const;

    TYPE m_type;
    Port::StringBase<char> m_token;
    Node* m_parent;
    Node* m_left_child;
    Node* m_right_child;
    unsigned int m_value;
};

#endif
