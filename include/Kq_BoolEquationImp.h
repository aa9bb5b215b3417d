// The engine of Kq_BoolEquation. Use Kq_BoolEquation.h unless you read tables without copying them,
// build a tree step by step, or turn the debug mode on and off.
//     Kq_BoolEquationImp engine;
//     if (!engine.SetEquation("A & ~B")) return 1; // refused
//     const Kq_BoolEquationImp::TruthTable table = engine.GetTruthTable();
//     std::cout << table.GetVariableNames()[1].c_str() << '\n'; // B
//     std::cout << table.GetRows()[2].GetResultValue() << '\n'; // 1

#ifndef KQ_BOOLEQUATIONIMP_H
#define KQ_BOOLEQUATIONIMP_H

#include <memory>

#include <Kq_BoolEquation.h>

// Inside the library: the tokens of a text, its tree, an init value as read, what an equation
// holds, and the pool's table of names.
class KqDigits;
class KqNamePool;
class KqStore;
class KqTokens;
struct KqTree;

// One equation: nodes that its copies share, and its own variable table.
// Text becomes nodes (TokenizeNodes), a tree (BuildTree), values (Eval), columns and text again.
// Fails: bad input gives false, 0 or empty; only std::bad_alloc is thrown, or what a sink throws.
// Threads: different objects are independent, whatever they share inside; const members of one
// object may run at once; changing an object needs exclusive access. Static members at any time.
// Invariants:
// 1. m_store is never null; its count is the number of engine objects that point at it.
// 2. Variable names are unique; a variable's position is its index, its value is 0 or 1.
// 3. The list of a set equation is its tree in pre-order, and every ID node's value is the index of
//    the variable with its name.
class KQ_EXPORT Kq_BoolEquationImp {
  public:
    class Node;
    class StringMgr;
    class TruthTable;

    Kq_BoolEquationImp(); // no equation, no variables
    // Shares the other's nodes, copies its variables.
    Kq_BoolEquationImp(const Kq_BoolEquationImp& other);
    ~Kq_BoolEquationImp(); // the last object that shares the nodes frees them
    // Two names for the same.  Fails: std::bad_alloc; this object stays as it is.
    Kq_BoolEquationImp& operator=(const Kq_BoolEquationImp& other);
    void Copy(const Kq_BoolEquationImp& other);

    // Removes equation and variables; other objects that share the nodes keep them.
    void Clear();
    // As in Kq_BoolEquation.
    bool SetEquation(const Port::StringBase<char>& text);
    bool SetEquationWithExplicitTerms(const std::vector<Port::StringBase<char>>& terms,
                                      const Port::StringBase<char>& equation, bool termOrderFlag,
                                      bool reverseTerms);
    static Kq_BoolEquation::Refusal
    FindRefusal(const Port::StringBase<char>& text,
                const std::vector<Port::StringBase<char>>* terms = nullptr);
    unsigned int Eval() const;

    // Whether the lists have the same length and the trees the same nodes, or not. Variables do not
    // count.
    bool operator==(const Kq_BoolEquationImp& other) const;
    bool operator!=(const Kq_BoolEquationImp& other) const;
    bool operator!() const;         // whether there is no equation
    operator Kq_PtrTester*() const; // null without an equation, else a value only for testing
    bool IsExpression() const;      // whether there is an equation that is not an init value

    // Appends one node for each token of 'text' to the empty list; links nothing. Does nothing for
    // a null or empty text or a list that is not empty. A text that is refused clears the object.
    // The text ends at its first NUL byte.
    void TokenizeNodes(const char* text);
    // Links the listed nodes into a tree, checks it and records its root. Does nothing when there
    // is a root or no node. A list that is not an equation clears the object.
    void BuildTree();

    // As in Kq_BoolEquation.
    Port::StringBase<char> GetEquation(bool spaces) const;
    Port::StringBase<char> GetEquationAlt1(bool spaces) const;
    Port::StringBase<char> GetEquationAlt2(bool spaces) const;
    Port::StringBase<char> GetEquationAlt3(bool spaces) const;
    Port::StringBase<char> GetEquationAsExpression(bool spaces) const;

    // As in Kq_BoolEquation.
    bool IsHexInitValue() const;
    bool IsBinaryInitValue() const;
    Port::StringBase<char> GetEquationAsHexInitValue(bool upperCase) const;
    Port::StringBase<char> GetEquationAsBinaryInitValue() const;
    Port::StringBase<char> GetInitValueTermEquation() const;

    // As in Kq_BoolEquation.
    bool DefineVariable(const Port::StringBase<char>& name, unsigned int value);
    bool IsVariableDefined(const Port::StringBase<char>& name) const;
    bool IsVariableDefined(const Kq_BoolEquation::Handle& handle) const;
    bool SetVariable(const Port::StringBase<char>& name, unsigned int value);
    bool SetVariable(const Kq_BoolEquation::Handle& handle, unsigned int value);
    unsigned int GetVariable(const Port::StringBase<char>& name) const;
    unsigned int GetVariable(const Kq_BoolEquation::Handle& handle) const;
    Kq_BoolEquation::Handle GetVariableHandle(const Port::StringBase<char>& name) const;
    unsigned int GetNumVariables() const;
    const std::vector<std::pair<Port::StringBase<char>, unsigned int>>& GetVariables() const;

    // As in Kq_BoolEquation.
    TruthTable GetTruthTable() const;
    bool GetColumn(std::vector<uint64_t>& words) const;
    bool GetColumn(std::vector<uint64_t>& words, bool (*goOn)(void*), void* context) const;

    // The root of the tree, null without an equation. Only for reading: results are kept of the
    // nodes, which live until this object and every copy are set, cleared or destroyed. The nodes
    // of an init value are made on the first call and may be many.  Fails: std::bad_alloc.
    const Node* GetRoot() const;

    void Dbg() const; // writes texts, variables, nodes and truth table to the message manager

    // A request for the size of an engine object goes to the class allocator.
    // Deliberate: for any other size mav_malloc gives the size of one engine object, so a derived
    // class that adds members must bring its own operators.
    // Fails: std::bad_alloc.
    static void* operator new(size_t size);
    static void operator delete(void* memory, size_t size);

    // While on, Eval and the tree builder trace what they do. Off unless the environment variable
    // MAV_KQ_BOOL_EQUATION_DEBUG exists when the library is loaded.
    static bool GetInternalDebugMode();
    static void SetInternalDebugMode(bool on);

    static std::allocator<Kq_BoolEquationImp> m_kq_boolequationimp_mem; // serves operator new

  private:
    typedef std::pair<Port::StringBase<char>, unsigned int> Variable;

    static KqNamePool& GetNamePool();

    void ReplaceStore(KqStore* fresh) noexcept;
    const Node* GetExpressionRoot() const;
    bool SetExpression(const char* text, size_t length, std::vector<Variable> inputs,
                       const Port::StringBase<char>* initValue);
    bool SetDigits(std::unique_ptr<KqDigits> digits, std::vector<Variable> inputs);
    bool BuildSilently(const KqTokens& tokens, std::vector<Variable>& inputs,
                       const Port::StringBase<char>* initValue);
    bool BuildTraced(const KqTokens& tokens, std::vector<Variable>& inputs,
                     const Port::StringBase<char>* initValue);
    void FinishTree(const KqTokens& tokens, const Port::StringBase<char>* initValue, Node* root,
                    KqTree& tree);
    void TakeVariables(std::vector<Variable>& inputs);
    size_t FindVariable(const Port::StringBase<char>& name) const;
    size_t FindVariable(const Kq_BoolEquation::Handle& handle) const;
    std::vector<Port::StringBase<char>> GetVariableNames() const;

    KqStore* m_store;
    std::vector<Variable> m_variables;
};

// The process-wide pool of names: each distinct name is kept once, until unload. It only grows.
// Threads: all at any time, except the destructor.
class KQ_EXPORT Kq_BoolEquationImp::StringMgr {
  public:
    StringMgr();  // no names
    ~StringMgr(); // frees all names
    // Not to be copied: names are known by their address.
    StringMgr(const StringMgr&) = delete;
    StringMgr& operator=(const StringMgr&) = delete;

    // The one string equal to 'name' (null counts as empty), made on first request.
    // Valid until the pool is destroyed.  Fails: std::bad_alloc; the pool stays usable.
    // Cost: in step with the name's length, whatever the number of names.
    const Port::StringBase<char>& find(const char* name);

    struct StringMgrNode; // holds the names; completed inside the library

  private:
    friend class Kq_BoolEquationImp;

    static void cleanup(StringMgrNode* node);

    StringMgrNode* m_root;
};

// The engine's truth table. Empty (no names, no rows, no text) or built (n names, 2^n rows); row k
// is the assignment whose binary number, first variable most significant, is k.
class KQ_EXPORT Kq_BoolEquationImp::TruthTable {
  public:
    class Row;

    TruthTable(); // empty
    // The table of the equation as Build makes it, or a copy.
    TruthTable(const Kq_BoolEquationImp& equation);
    TruthTable(const TruthTable& other);
    ~TruthTable();
    TruthTable& operator=(const TruthTable& other);
    TruthTable& operator=(const Kq_BoolEquationImp& equation);

    // Tabulates 'equation' over all its variables; values set on it stay as they are.
    // Stays empty without a tree, without variables and, deliberately, with more than 30.
    // In debug mode a message's receiver may change this table, but not destroy it.
    // Fails: std::bad_alloc, or what a receiver throws, with the rows appended so far.
    void Build(const Kq_BoolEquationImp& equation);

    // In the order of variable indices; the reference is valid until the table is set or destroyed.
    const std::vector<Port::StringBase<char>>& GetVariableNames() const;
    // Row k at index k; the reference is valid until the table is set or destroyed.
    const std::vector<Row>& GetRows() const;

    // Whether the names, in order, and the rows agree or differ. The text is not compared.
    bool operator==(const TruthTable& other) const;
    bool operator!=(const TruthTable& other) const;
    bool operator!() const;         // whether there are no names
    operator Kq_PtrTester*() const; // null without names, else a value only for testing
    void Dbg() const;               // writes the table to the message manager

  private:
    std::vector<Port::StringBase<char>> m_variable_names;
    std::vector<Row> m_rows;
    Port::StringBase<char> m_equation;
};

class KQ_EXPORT Kq_BoolEquationImp::TruthTable::Row { // one assignment and its result
  public:
    // Result and variable values as given, or a copy.
    Row(unsigned int resultValue, const std::vector<unsigned int>& variableValues);
    Row(const Row& other);
    ~Row();
    Row& operator=(const Row& other);

    unsigned int GetResultValue() const; // 0 or 1
    // 0 or 1 for each name of the table, in their order; valid as long as the row.
    const std::vector<unsigned int>& GetVariableValues() const;

    // Whether result and variable values agree or differ.
    bool operator==(const Row& other) const;
    bool operator!=(const Row& other) const;
    void Dbg() const; // writes the row to the message manager

  private:
    std::vector<unsigned int> m_variable_values;
    unsigned int m_result_value;
};

#endif
