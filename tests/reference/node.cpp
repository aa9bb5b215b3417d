// Facts about single nodes, as plain tables.
#include "reference/node.h"

namespace reference {

namespace {

struct TypeRow {
    const char* name;
    const char* spellings[3]; // null: the own token
};

const TypeRow kTypes[] = {
    {"AND", {"&", "*", ".AND."}},     {"0", {"0", "0", "0"}},
    {"1", {"1", "1", "1"}},           {"ID", {nullptr, nullptr, nullptr}},
    {"LP", {"(", "(", "("}},          {"NAND", {"~&", "~*", ".NAND."}},
    {"NOR", {"~|", "~+", ".NOR."}},   {"NOT", {"~", "~", "~"}},
    {"NXOR", {"~^", "~@", ".NXOR."}}, {"OR", {"|", "+", ".OR."}},
    {"RP", {")", ")", ")"}},          {"TRUTH_TABLE", {nullptr, nullptr, nullptr}},
    {"XOR", {"^", "@", ".XOR."}},     {"SENTINEL", {"?", "?", "?"}},
};

} // namespace

bool IsBinOp(Type type)
{
    return type != kLp && type != kRp && type != kId && type != kNot && type != kSentinel;
}

const char* TypeName(Type type)
{
    return kTypes[type].name;
}

std::string Spelling(const Node& node, int syntax)
{
    if (syntax == 0)
        return node.token;
    const char* spelling = kTypes[node.type].spellings[syntax - 1];
    return spelling ? spelling : node.token;
}

int TopParent(const std::vector<Node>& nodes, int start)
{
    int node = start;
    for (size_t numSteps = 0; numSteps <= nodes.size(); ++numSteps) {
        const int parent = nodes[static_cast<size_t>(node)].parent;
        if (parent == kNone)
            return node;
        node = parent;
    }
    // More steps than nodes: the links form a circle.
    node = start;
    for (;;) {
        const int parent = nodes[static_cast<size_t>(node)].parent;
        const Node& parentNode = nodes[static_cast<size_t>(parent)];
        if (parentNode.left != node && parentNode.right != node)
            return node;
        node = parent;
    }
}

} // namespace reference
