// The command 'tree': the expression tree as indented text, as a Graphviz graph or as JSON.
#include "tree.h"

#include <algorithm>

#include "answer.h"
#include "commands.h"

namespace booleq {

namespace {

constexpr size_t kMaxIndent = 40; // levels; deeper, the depth is written as a number

void PutText(const TreeList& list, Output& output)
{
    for (size_t index = 0; index < list.Entries().size(); ++index) {
        const size_t depth = list.Entries()[index].depth;
        const std::string deep = depth > kMaxIndent ? "[" + std::to_string(depth) + "] " : "";
        output.Put(std::string(2 * std::min(depth, kMaxIndent), ' ') + deep + list.Label(index) +
                   "\n");
    }
}

Json Link(size_t index)
{
    return index == TreeList::kNoNode ? Json() : Json(index);
}

// A list, not nested objects: the text decides the depth, and JSON readers have their limits.
Json AsJson(const TreeList& list)
{
    Json nodes = Json::array();
    for (size_t index = 0; index < list.Entries().size(); ++index) {
        const TreeList::Entry& entry = list.Entries()[index];
        Json json;
        json["id"] = index;
        json["type"] = list.TypeName(index);
        json["token"] = list.Token(index);
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
    RefuseTwoFormats(request, "--dot");
    return ForEachText(request, output, [&](const Text& text) {
        Kq_BoolEquation equation;
        if (!SetEquation(text, request, output, equation))
            return kRefused;
        const TreeList list(equation);
        const auto putText = [&] {
            if (!request.Has("--dot"))
                return PutText(list, output);
            if (text.line > 0)
                output.Put("// line " + std::to_string(text.line) + "\n");
            PutDot(list, [&output](const std::string& piece) { output.Put(piece); });
        };
        return Say(text, request, output,
                   {kDone, "done", request.Has("--dot") ? LineMark::Nothing : LineMark::Heading,
                    [&] { return AsJson(list); }, putText});
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
        "Children are printed below their operator, the left one first; an init value is shown as\n"
        "the expression it stands for. Below 40 levels the depth is written as a number.\n",
        {{"--dot", nullptr, "Print a graph for Graphviz"}},
        {"booleq tree 'a | b & ~c'", "booleq tree --dot 'a | b & ~c' > tree.dot"},
        RunTree};
}

} // namespace booleq
