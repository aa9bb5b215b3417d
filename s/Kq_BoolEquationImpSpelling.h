// The one table of spellings: every operator, parenthesis and constant in every accepted form, and
// each node type's name and spelling in the three fixed syntaxes.
// The tokenizer reads it to name what it found, the nodes to write themselves.
#ifndef KQ_BOOLEQUATIONIMPSPELLING_H
#define KQ_BOOLEQUATIONIMPSPELLING_H

#include <Kq_BoolEquationImpNode.h>

namespace KqSpelling {

typedef Kq_BoolEquationImp::Node Node;

// Row of kSpellings.
enum Id : unsigned char {
    kAmpersand,
    kStar,
    kDotAnd,
    kBar,
    kPlus,
    kDotOr,
    kCaret,
    kAt,
    kDotXor,
    kTildeAmpersand,
    kTildeStar,
    kBangAmpersand,
    kBangStar,
    kDotNand,
    kTildeBar,
    kTildePlus,
    kBangBar,
    kBangPlus,
    kDotNor,
    kTildeCaret,
    kTildeAt,
    kBangCaret,
    kBangAt,
    kDotNxor,
    kTilde,
    kBang,
    kDotNot,
    kLeftParen,
    kRightParen,
    kZero,
    kOne,
    kUnset,    // a node without a token
    kCorrupt,  // a type that does not exist
    kOwnToken, // not in the table: the node writes the token it carries
    kNumSpellings = kOwnToken
};

struct Spelling {
    const char* text;
    Node::TYPE type;
};

constexpr Spelling kSpellings[kNumSpellings] = {
    {"&", Node::AND},      {"*", Node::AND},       {".AND.", Node::AND}, {"|", Node::OR},
    {"+", Node::OR},       {".OR.", Node::OR},     {"^", Node::XOR},     {"@", Node::XOR},
    {".XOR.", Node::XOR},  {"~&", Node::NAND},     {"~*", Node::NAND},   {"!&", Node::NAND},
    {"!*", Node::NAND},    {".NAND.", Node::NAND}, {"~|", Node::NOR},    {"~+", Node::NOR},
    {"!|", Node::NOR},     {"!+", Node::NOR},      {".NOR.", Node::NOR}, {"~^", Node::NXOR},
    {"~@", Node::NXOR},    {"!^", Node::NXOR},     {"!@", Node::NXOR},   {".NXOR.", Node::NXOR},
    {"~", Node::NOT},      {"!", Node::NOT},       {".NOT.", Node::NOT}, {"(", Node::LP},
    {")", Node::RP},       {"0", Node::ZERO},      {"1", Node::ONE},     {"?", Node::SENTINEL},
    {"??", Node::SENTINEL}};

struct TypeSpelling {
    const char* name;
    Id alt[3]; // syntax 1, 2, 3
};

constexpr unsigned int kNumTypes = 14;

// Indexed by Node::TYPE; the last row is for every value that is none.
constexpr TypeSpelling kTypes[kNumTypes + 1] = {{"AND", {kAmpersand, kStar, kDotAnd}},
                                                {"0", {kZero, kZero, kZero}},
                                                {"1", {kOne, kOne, kOne}},
                                                {"ID", {kOwnToken, kOwnToken, kOwnToken}},
                                                {"LP", {kLeftParen, kLeftParen, kLeftParen}},
                                                {"NAND", {kTildeAmpersand, kTildeStar, kDotNand}},
                                                {"NOR", {kTildeBar, kTildePlus, kDotNor}},
                                                {"NOT", {kTilde, kTilde, kTilde}},
                                                {"NXOR", {kTildeCaret, kTildeAt, kDotNxor}},
                                                {"OR", {kBar, kPlus, kDotOr}},
                                                {"RP", {kRightParen, kRightParen, kRightParen}},
                                                {"TRUTH_TABLE", {kOwnToken, kOwnToken, kOwnToken}},
                                                {"XOR", {kCaret, kAt, kDotXor}},
                                                {"SENTINEL", {kUnset, kUnset, kUnset}},
                                                {"UNKNOWN", {kCorrupt, kCorrupt, kCorrupt}}};

// The spellings as strings, by Id, made once and shared by all nodes; valid until unload.
const Port::StringBase<char>* GetTexts();

} // namespace KqSpelling

#endif
