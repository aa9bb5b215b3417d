// The command 'tree': the expression tree as indented text, as a Graphviz graph, as JSON.
#include <Kq_BoolEquationImp.h>
#include <Kq_BoolEquationImpNode.h>

#include <algorithm>

#include "answer.h"
#include "commands.h"
#include "core/text.h"

namespace booleq {

namespace {

typedef Kq_BoolEquationImp::Node Node;

constexpr size_t kNoNode = static_cast<size_t>(-1);
constexpr size_t kMaxIndent = 40; // levels; below, the depth is written as a number

// A node of the printed tree. A group is one node; its ")" is left out.
struct Entry {
    const Node* node;
    size_t depth;
    size_t parent;
    size_t left = kNoNode;
    size_t right = kNoNode;
};

// Pre-order, left before right; with a stack of its own, as the text decides the depth.
std::vector<Entry> ListTree(const Node* root)
{
    struct Pending {
        const Node* node;
        size_t depth;
        size_t parent;
        bool isRight;
    };
    std::vector<Entry> entries;
    std::vector<Pending> pending = {{root, 0, kNoNode, false}};
    while (!pending.empty()) {
        const Pending next = pending.back();
        pending.pop_back();
        const size_t index = entries.size();
        entries.push_back({next.node, next.depth, next.parent});
        if (next.parent != kNoNode)
            (next.isRight ? entries[next.parent].right : entries[next.parent].left) = index;
        const Node* right = next.node->GetRightChild();
        if (right && !right->IsRp())
            pending.push_back({right, next.depth + 1, index, true});
        if (next.node->GetLeftChild())
            pending.push_back({next.node->GetLeftChild(), next.depth + 1, index, false});
    }
    return entries;
}

std::string TypeName(const Node& node)
{
    return node.IsLp() ? "GROUP" : ToStd(node.GetTypeName());
}

std::string Token(const Node& node)
{
    return node.IsLp() ? "( )" : ToStd(node.GetToken());
}

// Operators and groups with their type, names and constants as they are.
std::string Label(const Node& node)
{
    const std::string token = Visible(Token(node));
    return node.IsId() || node.IsConst() ? token : TypeName(node) + "  " + token;
}

void PutText(const std::vector<Entry>& entries, Output& output)
{
    for (const Entry& entry : entries) {
        const std::string deep =
            entry.depth > kMaxIndent ? "[" + std::to_string(entry.depth) + "] " : "";
        output.Put(std::string(2 * std::min(entry.depth, kMaxIndent), ' ') + deep +
                   Label(*entry.node) + "\n");
    }
}

std::string DotString(const std::string& text)
{
    std::string quoted = "\"";
    for (const char character : text) {
        if (character == '"' || character == '\\')
            quoted += '\\';
        quoted += character;
    }
    return quoted + "\"";
}

void PutDot(const std::vector<Entry>& entries, Output& output)
{
    output.Put("digraph equation {\n  node [shape=box, fontname=\"monospace\"];\n");
    for (size_t index = 0; index < entries.size(); ++index) {
        const Entry& entry = entries[index];
        const std::string name = "n" + std::to_string(index);
        output.Put("  " + name + " [label=" + DotString(Label(*entry.node)) +
                   (entry.node->IsId() ? ", shape=ellipse];\n" : "];\n"));
        if (entry.parent != kNoNode)
            output.Put("  n" + std::to_string(entry.parent) + " -> " + name + ";\n");
    }
    output.Put("}\n");
}

Json Link(size_t index)
{
    return index == kNoNode ? Json() : Json(index);
}

// A list, not a tree of objects: the text decides the depth, and readers have their limits.
Json AsJson(const std::vector<Entry>& entries)
{
    Json nodes = Json::array();
    for (size_t index = 0; index < entries.size(); ++index) {
        const Entry& entry = entries[index];
        Json json;
        json["id"] = index;
        json["type"] = TypeName(*entry.node);
        json["token"] = Token(*entry.node);
        json["parent"] = Link(entry.parent);
        json["left"] = Link(entry.left);
        json["right"] = Link(entry.right);
        nodes.push_back(std::move(json));
    }
    Json result;
    result["nodes"] = std::move(nodes);
    return result;
}

int RunTree(const Request& request, Output& output)
{
    if (request.json && request.Has("--dot"))
        throw UsageError("--json and --dot are two formats: give one");
    return ForEachText(request, output, [&](const Text& text) {
        Kq_BoolEquation equation;
        if (!SetEquation(text, request, output, equation))
            return kRefused;
        const std::vector<Entry> entries = ListTree(equation.GetImp()->GetRoot());
        if (request.json) {
            PutJson(text, request, "done", AsJson(entries), output);
            return kDone;
        }
        if (text.line > 0)
            output.Put((request.Has("--dot") ? "// line " : "line ") + std::to_string(text.line) +
                       "\n");
        if (request.Has("--dot"))
            PutDot(entries, output);
        else
            PutText(entries, output);
        return kDone;
    });
}

} // namespace

Command TreeCommand()
{
    return {
        "tree",
        "EQUATION",
        1,
        1,
        "Print the expression tree",
        "Children stand below their operator, the left one first; an init value is shown as the\n"
        "expression that it stands for. Below 40 levels the depth is written as a number.\n",
        {{"--dot", nullptr, "Print a graph for Graphviz"}},
        {"booleq tree 'a | b & ~c'", "booleq tree --dot 'a | b & ~c' > tree.dot"},
        RunTree};
}

} // namespace booleq
