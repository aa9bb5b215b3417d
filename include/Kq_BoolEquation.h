// Boolean equations: text in, tree, values, truth table and look-up-table init values out.
//     Kq_BoolEquation equation("A & ~B");
//     if (!equation) return 1; // refused
//     equation.SetVariable("A", 1); // every variable starts at 0
//     std::cout << equation.Eval() << '\n'; // 1
//     std::cout << equation.GetEquationAsHexInitValue(false).c_str() << '\n'; // 0x4

// A comment stands for the declarations below it, up to a blank line or the next comment.

#ifndef KQ_BOOLEQUATION_H
#define KQ_BOOLEQUATION_H

#include <cstddef>
#include <cstdint>
#include <utility>
#include <vector>

#include <port/Port_StringBase.h>

#ifndef KQ_EXPORT
#define KQ_EXPORT __attribute__((visibility("default")))
#endif

class Kq_BoolEquationImp;
class Kq_PtrTester; // never defined: a pointer to it is only for testing in a condition

// One equation with its variables, each 0 or 1. Copies share parsed nodes, never variable values.
// Fails: bad input gives false, 0 or empty; only std::bad_alloc is thrown, or what a sink throws.
// Threads: objects are independent; const members may run at once; changes need exclusive access.
// Invariant: m_imp is the engine object, made by its class's operator new; nobody else owns it.
class KQ_EXPORT Kq_BoolEquation {
  public:
    class Handle;
    class TruthTable;
    struct Refusal;

    Kq_BoolEquation();                                       // no equation, no variables
    Kq_BoolEquation(const Port::StringBase<char>& equation); // sets it; empty when it is refused
    Kq_BoolEquation(const Kq_BoolEquation& other); // the same equation, variables and values
    ~Kq_BoolEquation(); // frees the engine object; nodes go with the last copy that shares them

    // Three names for copying all of the other.  Fails: std::bad_alloc; this object stays as it is.
    Kq_BoolEquation& operator=(const Kq_BoolEquation& other);
    void Copy(const Kq_BoolEquation& other);
    void SetEquationFromEquation(const Kq_BoolEquation& other);

    void Clear(); // removes equation and variables
    // Sets the equation from an expression, whose variables are numbered by first occurrence, or
    // from an init value ("0x8", "0b1000") over the variables defined now, the first being the most
    // significant. All start at 0.  Fails: false, and the object is empty.  Cost: O(text).
    bool SetEquation(const Port::StringBase<char>& equation);
    // Sets the equation over the inputs 'terms', the first being the first variable. Other names in
    // the text follow them. A term that is not a legal name or occurs twice is skipped.
    // For an init value only: 'termOrderFlag' gives the first variable the lowest bit of the row
    // number, not the highest; 'reverseTerms' defines terms from the last.  Fails: as SetEquation.
    bool SetEquationWithExplicitTerms(const std::vector<Port::StringBase<char>>& terms,
                                      const Port::StringBase<char>& equation, bool termOrderFlag,
                                      bool reverseTerms);

    // Why and where SetEquation on an object without variables, or SetEquationWithExplicitTerms
    // over 'terms' as given, refuses the text. Sets and dumps nothing.  Cost: that of setting.
    static Refusal FindRefusal(const Port::StringBase<char>& text,
                               const std::vector<Port::StringBase<char>>* terms = nullptr);

    // What the equation was set from: an expression, an init value "0x..." or one "0b...".
    bool IsExpression() const;
    bool IsHexInitValue() const;
    bool IsBinaryInitValue() const;

    // The equation as typed (an init value as given) or in a fixed syntax, 1: "& | ^ ~", 2: "* + @
    // ~", 3: ".AND. .OR. .XOR. ~". 'spaces': one blank between tokens. Empty without an equation.
    // Deliberate: parentheses are written where they were typed and nowhere else, so an equation
    // with a negated operator ("A ~ | B") followed by another one need not read back the same.
    Port::StringBase<char> GetEquation(bool spaces) const;
    Port::StringBase<char> GetEquationAlt1(bool spaces) const;
    Port::StringBase<char> GetEquationAlt2(bool spaces) const;
    Port::StringBase<char> GetEquationAlt3(bool spaces) const;
    // GetEquation for an expression, GetEquationAlt1 for an init value: never "0x...".
    Port::StringBase<char> GetEquationAsExpression(bool spaces) const;

    // The result column of n = 1 to 30 variables as one number, row 2^n-1 first, zeros kept: "0x"
    // and a digit ('upperCase': A to F) for every four rows or all of n = 1; "0b" and one for each.
    // Deliberate: without a truth table (a constant, no equation, over 30 variables) the texts are
    // "0x0" and "0b", for the constant 1 as well.  Cost: O(nodes * 2^n / 64).
    Port::StringBase<char> GetEquationAsHexInitValue(bool upperCase) const;
    Port::StringBase<char> GetEquationAsBinaryInitValue() const;
    Port::StringBase<char> GetInitValueTermEquation() const; // all names, the last first: "B+A"
    // The result column: row k is bit k % 64 of word k / 64; bits after the last row are 0. One row
    // without variables; never traced. goOn(context), unless null, is called every few
    // milliseconds, less often with over 100,000 operators; it may throw, change or destroy this.
    // Fails: false, and no words: no equation, n over 30, goOn false.  Cost: O(nodes * 2^n / 64).
    bool GetColumn(std::vector<uint64_t>& words) const;
    bool GetColumn(std::vector<uint64_t>& words, bool (*goOn)(void*), void* context) const;

    bool operator!() const;         // whether there is no equation
    operator Kq_PtrTester*() const; // null without an equation, else a value only for testing
    // Whether operators, groups and names agree, however spelled, or differ. Values do not count.
    bool operator==(const Kq_BoolEquation& other) const;
    bool operator!=(const Kq_BoolEquation& other) const;

    // The result, 0 or 1, for the current variable values; 0 without an equation.
    unsigned int Eval() const;
    // Adds a variable after the others; 'value' counts as 1 unless 0. A name is letters, digits and
    // '_', not a digit first, or starts with ' and has a second '.  Fails: false unless new, legal.
    bool DefineVariable(const Port::StringBase<char>& name, unsigned int value);
    // Whether there is a variable of this name, or one with the index that the handle holds.
    bool IsVariableDefined(const Port::StringBase<char>& name) const;
    bool IsVariableDefined(const Handle& handle) const;
    // Gives the variable the value 1, or 0 for 0.  Fails: false when there is no such variable.
    bool SetVariable(const Port::StringBase<char>& name, unsigned int value);
    bool SetVariable(const Handle& handle, unsigned int value);
    // The value, 0 or 1; 0 when there is no such variable.
    unsigned int GetVariable(const Port::StringBase<char>& name) const;
    unsigned int GetVariable(const Handle& handle) const;
    Handle GetVariableHandle(const Port::StringBase<char>& name) const; // empty: no such variable
    unsigned int GetNumVariables() const;                               // how many
    // Names and values in order of indices, from 0; a later definition invalidates the reference.
    const std::vector<std::pair<Port::StringBase<char>, unsigned int>>& GetVariables() const;

    // All results, 2^n rows of n values; empty without an equation, for n = 0 and for n > 30.
    TruthTable GetTruthTable() const;
    const Kq_BoolEquationImp* GetImp() const; // the engine object, owned by this one
    void Dbg() const; // writes all of it, the truth table too, to the message manager

  private:
    Kq_BoolEquationImp* m_imp;
};

// Where and why the tokenizer, builder or init value reader gave up. Bytes are counted from 0.
struct Kq_BoolEquation::Refusal {
    enum CODE : unsigned int { // what is wrong there; the numbers are fixed
        NONE = 0,              // nothing: the text is accepted
        EMPTY = 1,             // the text has no tokens
        CHARACTER = 2,         // this character begins no token
        WORD = 3,    // it stands between dots and is not an operator, or lacks the second dot
        QUOTE = 4,   // this quote has no second one
        PAREN = 5,   // this parenthesis has no partner
        OPERAND = 6, // an operand where an operator must stand
        NO_LEFT_OPERAND = 7,   // nothing on the left of this operator
        NO_RIGHT_OPERAND = 8,  // nothing on the right of this operator
        NO_OPERAND = 9,        // nothing after this negation
        NEGATED_OPERATOR = 10, // a negation apart from its operator, with no operand to take
        INIT_DIGIT = 11,       // over terms: not a digit of its base, or no x or b after the 0
        INIT_WIDTH = 12, // over terms: the number of digits is for another number of variables
        INIT_NAME = 13   // over terms: a name is not a single token, and its expression is refused
    };
    CODE code = NONE;  // why the text is refused
    size_t offset = 0; // where: the first byte
    size_t length = 0; // how many bytes from there
};

// A variable found once by name. Element 0 is the variable index, the others are the positions of
// the nodes with that name in the pre-order list, ascending. Empty: no such variable.
// Deliberate: it is a cached index, which any equation with enough variables accepts as its own.
class KQ_EXPORT Kq_BoolEquation::Handle {
  public:
    // Empty, or a copy with its own elements.
    Handle();
    Handle(const Handle& other);
    ~Handle();
    Handle& operator=(const Handle& other);

    // The first element, and one past the last; valid until the handle is set or destroyed.
    unsigned int* begin() { return m_values.data(); }
    const unsigned int* begin() const { return m_values.data(); }
    unsigned int* end() { return m_values.data() + m_values.size(); }
    const unsigned int* end() const { return m_values.data() + m_values.size(); }
    bool empty() const { return m_values.empty(); } // no variable was found
    size_t size() const { return m_values.size(); } // elements: 1 and the number of nodes
    bool operator==(const Handle& other) const;     // the same elements in the same order
    bool operator!=(const Handle& other) const;     // the opposite
    void Dbg() const;                               // writes all elements to the message manager

  private:
    friend class Kq_BoolEquationImp;
    explicit Handle(std::vector<unsigned int> values);
    std::vector<unsigned int> m_values;
};

// Every assignment of an equation's variables with its result; a value that keeps no link to the
// equation. Row k is the assignment whose binary number, first variable most significant, is k.
class KQ_EXPORT Kq_BoolEquation::TruthTable {
  public:
    class Row;

    TruthTable(); // empty
    // A deep copy, or the table of an equation as its GetTruthTable returns it.
    TruthTable(const TruthTable& other);
    TruthTable(const Kq_BoolEquation& equation);
    ~TruthTable();
    TruthTable& operator=(const TruthTable& other);
    TruthTable& operator=(const Kq_BoolEquation& equation);

    // Whether the names, in order, and the rows agree or differ. The text is not compared.
    bool operator==(const TruthTable& other) const;
    bool operator!=(const TruthTable& other) const;
    bool operator!() const;         // whether the table is empty
    operator Kq_PtrTester*() const; // null if it is, else a value only for testing

    std::vector<Port::StringBase<char>> GetVariableNames() const; // copies, in column order
    std::vector<Row> GetRows() const; // copies of all 2^n rows, row k at index k
    void Dbg() const;                 // writes the table to the message manager

  private:
    friend class Kq_BoolEquation;
    struct Imp;
    void Build(const Kq_BoolEquation& equation);
    Imp* m_imp; // owned
};

class KQ_EXPORT Kq_BoolEquation::TruthTable::Row { // one assignment and its result
  public:
    // Result and variable values as given, or a deep copy.
    Row(unsigned int resultValue, const std::vector<unsigned int>& variableValues);
    Row(const Row& other);
    ~Row();
    Row& operator=(const Row& other);
    bool operator==(const Row& other) const;             // the same result and variable values
    bool operator!=(const Row& other) const;             // the opposite
    unsigned int GetResultValue() const;                 // 0 or 1
    std::vector<unsigned int> GetVariableValues() const; // 0 or 1 for each, in column order
    void Dbg() const;                                    // writes the row to the message manager

  private:
    struct Imp;
    Imp* m_imp; // owned
};

#endif
