// A NOT writes nothing in its own place: it waits for the first token of its operand, or for the
// operator if its operand is a binary operator.
#include "reference/rendering.h"

namespace reference {

namespace {

typedef std::vector<int> Nots;

// Either a subtree to be rendered, or a node whose tokens are written now.
struct Task {
    bool writesNow;
    int node;
    Nots nots;
};

} // namespace

std::string RenderTree(const std::vector<Node>& nodes, int root, int syntax, bool spaces)
{
    std::string text;
    std::vector<Task> tasks;
    tasks.push_back(Task{false, root, Nots()});
    while (!tasks.empty()) {
        Task task = tasks.back();
        tasks.pop_back();
        if (task.node == kNone)
            continue;
        const Node& node = nodes[static_cast<size_t>(task.node)];
        if (task.writesNow) {
            task.nots.push_back(task.node);
            for (int token : task.nots) {
                if (spaces && !text.empty())
                    text += ' ';
                text += Spelling(nodes[static_cast<size_t>(token)], syntax);
            }
        } else if (node.type == kNot) {
            task.nots.push_back(task.node);
            tasks.push_back(Task{false, node.left, task.nots});
        } else if (IsBinOp(node.type)) {
            tasks.push_back(Task{false, node.right, Nots()});
            tasks.push_back(Task{true, task.node, task.nots});
            tasks.push_back(Task{false, node.left, Nots()});
        } else {
            tasks.push_back(Task{false, node.right, Nots()});
            tasks.push_back(Task{false, node.left, Nots()});
            tasks.push_back(Task{true, task.node, task.nots});
        }
    }
    return text;
}

} // namespace reference
