// Notations of expressions as tables: what an operator is called there, how tightly it binds, which
// names there are. One writer and one reader go by these tables.
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

// What values are, and so what the whole text says.
enum class Values : uint8_t {
    Bits,   // one bit each
    Vector, // as wide as the operands of the context, a number 32 bits; bit 0 of the result counts
    Int     // of 32 bits in C, of any width in Python; the result counts as 1 unless it is 0
};

// Which operators of one level may follow each other without parentheses.
enum class Chain : uint8_t { Any, Same, None };

struct OperatorForm {
    const char* text;
    Meaning meaning;
    uint8_t level; // higher binds tighter
    Chain chain;
    bool isWritten; // by the writer; others are only read
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
    bool mixesInParentheses; // the writer never mixes operators without: compilers warn
    bool hasAdjacentAnd;     // operands side by side are joined like "&"
    bool ignoresCase;
    bool (*isPlainName)(const std::string& name); // a name as it may stand, keywords apart
    const char* const* keywords;                  // ended by null
    std::string (*escape)(const std::string&); // any other name, empty when it cannot be; or null
};

const Notation& VerilogNotation();
const Notation& VhdlNotation();
const Notation& CNotation();
const Notation& PythonNotation();
const Notation& LibertyNotation();
const Notation& EqnNotation();

// Those that a text of this library's own syntax may be taken for.
const std::vector<const Notation*>& ForeignNotations();

// A name as it may stand in the notation, being no keyword either.
bool IsPlain(const Notation& notation, const std::string& name);
// A name for what reads networks of gates: what all of these readers take.
bool IsNetName(const std::string& name);

} // namespace booleq

#endif
