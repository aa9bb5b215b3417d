// The one table of spellings: every operator, parenthesis and constant in every accepted form, and
// each node type's name and spelling in the three fixed syntaxes. The tokenizer's tables are made
// from it at compile time, and nodes are written from it.
#ifndef KQ_SPELLING_H
#define KQ_SPELLING_H

#include <Kq_BoolEquationImpNode.h>

#include "Name.h"

struct KqSpelling {
    const char* text;
    Kq_BoolEquationImp::Node::TYPE type;
};

// What the tokenizer accepts. A spelling is one character, a negation character directly before an
// operator character, or a word between dots; SpellingTables.h checks this.
constexpr KqSpelling kKqSpellings[] = {
    {"&", Kq_BoolEquationImp::Node::AND},     {"*", Kq_BoolEquationImp::Node::AND},
    {".AND.", Kq_BoolEquationImp::Node::AND}, {"|", Kq_BoolEquationImp::Node::OR},
    {"+", Kq_BoolEquationImp::Node::OR},      {".OR.", Kq_BoolEquationImp::Node::OR},
    {"^", Kq_BoolEquationImp::Node::XOR},     {"@", Kq_BoolEquationImp::Node::XOR},
    {".XOR.", Kq_BoolEquationImp::Node::XOR}, {"~&", Kq_BoolEquationImp::Node::NAND},
    {"~*", Kq_BoolEquationImp::Node::NAND},   {"!&", Kq_BoolEquationImp::Node::NAND},
    {"!*", Kq_BoolEquationImp::Node::NAND},   {".NAND.", Kq_BoolEquationImp::Node::NAND},
    {"~|", Kq_BoolEquationImp::Node::NOR},    {"~+", Kq_BoolEquationImp::Node::NOR},
    {"!|", Kq_BoolEquationImp::Node::NOR},    {"!+", Kq_BoolEquationImp::Node::NOR},
    {".NOR.", Kq_BoolEquationImp::Node::NOR}, {"~^", Kq_BoolEquationImp::Node::NXOR},
    {"~@", Kq_BoolEquationImp::Node::NXOR},   {"!^", Kq_BoolEquationImp::Node::NXOR},
    {"!@", Kq_BoolEquationImp::Node::NXOR},   {".NXOR.", Kq_BoolEquationImp::Node::NXOR},
    {"~", Kq_BoolEquationImp::Node::NOT},     {"!", Kq_BoolEquationImp::Node::NOT},
    {".NOT.", Kq_BoolEquationImp::Node::NOT}, {"(", Kq_BoolEquationImp::Node::LP},
    {")", Kq_BoolEquationImp::Node::RP},      {"0", Kq_BoolEquationImp::Node::ZERO},
    {"1", Kq_BoolEquationImp::Node::ONE},
};

// A row of kKqSpellings.
typedef unsigned char KqSpellingId;

constexpr KqSpellingId kKqNumSpellings = sizeof kKqSpellings / sizeof kKqSpellings[0];
constexpr KqSpellingId kKqNoSpelling = kKqNumSpellings;

constexpr bool KqIsSameSpelling(const char* left, const char* right)
{
    for (; *left && *left == *right; ++left, ++right) {
    }
    return *left == *right;
}

// The row of a text, or kKqNoSpelling when there is none.
constexpr KqSpellingId KqSpellingOf(const char* text)
{
    for (KqSpellingId id = 0; id < kKqNumSpellings; ++id) {
        if (KqIsSameSpelling(kKqSpellings[id].text, text))
            return id;
    }
    return kKqNoSpelling;
}

struct KqTypeSpelling {
    const char* name;
    const char* syntaxes[3]; // in syntax 1, 2, 3; null: the node writes the token that it carries
};

constexpr unsigned int kKqNumTypes = 14;

// Indexed by Node::TYPE; the last row is for all other values.
constexpr KqTypeSpelling kKqTypes[kKqNumTypes + 1] = {
    {"AND", {"&", "*", ".AND."}},     {"0", {"0", "0", "0"}},
    {"1", {"1", "1", "1"}},           {"ID", {nullptr, nullptr, nullptr}},
    {"LP", {"(", "(", "("}},          {"NAND", {"~&", "~*", ".NAND."}},
    {"NOR", {"~|", "~+", ".NOR."}},   {"NOT", {"~", "~", "~"}},
    {"NXOR", {"~^", "~@", ".NXOR."}}, {"OR", {"|", "+", ".OR."}},
    {"RP", {")", ")", ")"}},          {"TRUTH_TABLE", {nullptr, nullptr, nullptr}},
    {"XOR", {"^", "@", ".XOR."}},     {"SENTINEL", {"?", "?", "?"}}, // a node without a token
    {"UNKNOWN", {"??", "??", "??"}},
};

// The texts of tokens and nodes. Made once, on the first request, and valid until unload.
const KqName& KqGetSpelling(KqSpellingId id);
// The type's spelling in the syntax 'syntaxIndex', 0 to 2; null when the node writes its own token.
const Port::StringBase<char>* KqGetTypeSpelling(unsigned int type, unsigned int syntaxIndex);
const Port::StringBase<char>& KqGetTypeName(unsigned int type);

#endif
