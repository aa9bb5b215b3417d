// Notations of expressions as tables: what an operator is called, how tightly it binds, which names
// exist. One writer and one reader use these tables.
#ifndef BOOLEQ_NOTATION_NOTATION_H
#define BOOLEQ_NOTATION_NOTATION_H

#include <cstdint>
#include <string>
#include <vector>

#include "expression.h"

namespace booleq {

// What an operator of a notation does to its operands' values.
enum class Meaning : uint8_t {
    Zero,
    One,
    WideZero, // a number as wide as an int
    WideOne,
    Input,
    BitNot,     // of every bit of a value
    LogicalNot, // 1 for the value 0, otherwise 0
    And,
    Or,
    Xor,
    Nand,
    Nor,
    Nxor,
    Add,
    Multiply,
    Foreign // the notation has the token, but the tool does not read it
};

// What this library means by an operator.
Meaning MeaningOf(Operator op);

// What a value is, and so what the whole text means.
enum class Values : uint8_t {
    Bits,   // one bit each
    Vector, // as wide as the operands of the context, numbers 32 bits; the result is bit 0
    Int     // 32 bits in C, any width in Python; the result is 1 unless the value is 0
};

// Which operators of one level may follow each other without parentheses.
enum class Chain : uint8_t { Any, Same, None };

struct OperatorForm {
    const char* text;
    Meaning meaning;
    uint8_t level; // higher binds tighter
    Chain chain;
    bool isWritten; // the writer uses it; others are only read
};

struct Notation {
    const char* name;
    Values values;
    const char* zero;
    const char* one;
    bool numbersAreBits; // 0 and 1 are single bits, not numbers
    std::vector<OperatorForm> prefixes;
    bool prefixesNest; // two may follow each other
    std::vector<OperatorForm> postfixes;
    std::vector<OperatorForm> binaries;
    bool mixesInParentheses; // the writer always separates different operators: compilers warn
    bool hasAdjacentAnd;     // operands side by side are joined like "&"
    bool ignoresCase;
    bool (*isPlainName)(const std::string& name); // can stand as it is, if not a keyword
    const char* const* keywords;                  // ended by null
    std::string (*escape)(const std::string&); // spells any other name; empty if it cannot; or null
};

const Notation& VerilogNotation();
const Notation& VhdlNotation();
const Notation& CNotation();
const Notation& PythonNotation();
const Notation& LibertyNotation();
const Notation& EqnNotation();

// The notations that a text in this library's own syntax may be mistaken for.
const std::vector<const Notation*>& ForeignNotations();

// Whether the name can stand in the notation as it is; a keyword cannot.
bool IsPlain(const Notation& notation, const std::string& name);
// Whether all readers of networks of gates accept the name.
bool IsNetName(const std::string& name);

} // namespace booleq

#endif
