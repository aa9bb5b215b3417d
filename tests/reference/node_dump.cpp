// The dump walks with an explicit stack: node first, then left subtree, then right subtree.
#include "reference/node_dump.h"

#include <utility>

#include "reference/message.h"

namespace reference {

namespace {

const int kPieceLine = 487;
const int kLeftLine = 503;
const int kRightLine = 508;
const int kNodeLine = 512;
const size_t kMaxFailureLines = 256;

const Node& At(const std::vector<Node>& nodes, int node)
{
    return nodes[static_cast<size_t>(node)];
}

void EmitPieces(int numPieces)
{
    for (int piece = 0; piece < numPieces; ++piece)
        Emit(Module::Node, kPieceLine, "  ");
}

void EmitNode(const std::vector<Node>& nodes, int index, int depth)
{
    const Node& node = At(nodes, index);
    std::string parentName;
    if (node.parent != kNone) {
        parentName = PathName(nodes, node.parent);
        if (At(nodes, node.parent).left == index) {
            EmitPieces(depth - 1);
            Emit(Module::Node, kLeftLine, "LEFT:\n");
        } else if (At(nodes, node.parent).right == index) {
            EmitPieces(depth - 1);
            Emit(Module::Node, kRightLine, "RIGHT:\n");
        }
    }
    EmitPieces(depth);
    Emit(Module::Node, kNodeLine,
         "NODE: " + PathName(nodes, index) + " parent=" + parentName +
             " type=" + TypeName(node.type) + " token=" + CText(node.token) +
             " val=" + Decimal(node.value) + "\n");
}

void DumpSubtree(const std::vector<Node>& nodes, int start, size_t maxLines)
{
    std::vector<std::pair<int, int>> pending; // node, depth
    pending.push_back({start, 0});
    size_t numLines = 0;
    while (!pending.empty()) {
        const std::pair<int, int> next = pending.back();
        pending.pop_back();
        if (numLines == maxLines) {
            Emit(Module::Node, kNodeLine, "NODE: ...\n");
            return;
        }
        EmitNode(nodes, next.first, next.second);
        ++numLines;
        const Node& node = At(nodes, next.first);
        if (node.right != kNone)
            pending.push_back({node.right, next.second + 1});
        if (node.left != kNone)
            pending.push_back({node.left, next.second + 1});
    }
}

} // namespace

std::string PathName(const std::vector<Node>& nodes, int index)
{
    std::string reversed;
    int node = index;
    while (At(nodes, node).parent != kNone) {
        const int parent = At(nodes, node).parent;
        if (At(nodes, parent).left == node)
            reversed += 'L';
        else if (At(nodes, parent).right == node)
            reversed += 'R';
        else
            return std::string(reversed.rbegin(), reversed.rend());
        node = parent;
    }
    return "TOP." + std::string(reversed.rbegin(), reversed.rend());
}

void DumpNode(const std::vector<Node>& nodes, int node)
{
    DumpSubtree(nodes, node, static_cast<size_t>(-1));
}

void DumpFailure(const std::vector<Node>& nodes, int node)
{
    DumpSubtree(nodes, node, kMaxFailureLines);
}

} // namespace reference
