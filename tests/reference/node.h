// The model's node: a token of the text, linked to others by their indices in one vector.
// Type numbers, type names and the spellings of the three fixed syntaxes.
#ifndef REFERENCE_NODE_H
#define REFERENCE_NODE_H

#include <string>
#include <vector>

namespace reference {

enum Type {
    kAnd = 0,
    kZero = 1,
    kOne = 2,
    kId = 3,
    kLp = 4,
    kNand = 5,
    kNor = 6,
    kNot = 7,
    kNxor = 8,
    kOr = 9,
    kRp = 10,
    kTruthTable = 11,
    kXor = 12,
    kSentinel = 13
};

const int kNone = -1;

struct Node {
    Type type;
    std::string token;
    int parent = kNone;
    int left = kNone;
    int right = kNone;
    unsigned int value = 0;

    Node(Type theType, const std::string& theToken) : type(theType), token(theToken) {}
};

// True for everything except a parenthesis, a name, a NOT and a SENTINEL; constants give true.
bool IsBinOp(Type type);

const char* TypeName(Type type);

// 'syntax' 0 is the token as typed; 1, 2 and 3 are the fixed syntaxes.
std::string Spelling(const Node& node, int syntax);

// Where parent links lead. If they form a circle: the first node on the way that is not a child of
// its parent.
int TopParent(const std::vector<Node>& nodes, int start);

} // namespace reference

#endif
