// Conversions and comparisons; each comparison reports only the first difference.
#include "support/library_view.h"

#include <algorithm>
#include <cstdio>
#include <unordered_map>

namespace support {

namespace {

typedef Kq_BoolEquationImp::Node Node;

std::string Describe(const Captured& message)
{
    return message.id + " " + message.file + ":" + std::to_string(message.line) + " " +
           message.revision + " \"" + Printable(message.text) + "\"";
}

std::string Describe(const reference::Message& message)
{
    return Describe(
        Captured{message.id, message.file, message.line, message.revision, message.text});
}

bool Matches(const reference::Message& expected, const Captured& actual)
{
    const bool lineMatches =
        expected.line == reference::kAnyLine ? actual.line > 0 : actual.line == expected.line;
    return lineMatches && actual.text == expected.text && actual.id == expected.id &&
           actual.file == expected.file && actual.revision == expected.revision;
}

bool IsNodeDumpPiece(const Captured& message)
{
    return message.file == reference::NodeModulePath() &&
           (message.line == 487 || message.line == 503 || message.line == 508 ||
            message.line == 512);
}

std::string Describe(const reference::FlatNode& node)
{
    return std::to_string(node.type) + " \"" + Printable(node.token) +
           "\" parent=" + std::to_string(node.parent) + " left=" + std::to_string(node.left) +
           " right=" + std::to_string(node.right) + " value=" + std::to_string(node.value);
}

} // namespace

Capture::Capture()
{
    m_former = Port_MsgManData::setSink(
        [this](const char* id, const char* file, int line, const char* revision, const char* text) {
            messages.push_back(Captured{id, file, line, revision, text});
        });
}

Capture::~Capture()
{
    Port_MsgManData::setSink(m_former);
}

DebugMode::DebugMode()
{
    reference::SetDebugMode(true);
    Kq_BoolEquationImp::SetInternalDebugMode(true);
}

DebugMode::~DebugMode()
{
    reference::SetDebugMode(false);
    Kq_BoolEquationImp::SetInternalDebugMode(false);
}

Port::StringBase<char> ToPort(const std::string& text)
{
    Port::StringBase<char> result;
    for (char c : text)
        result += c;
    return result;
}

std::string ToStd(const Port::StringBase<char>& text)
{
    return std::string(text.c_str(), text.length());
}

std::vector<Port::StringBase<char>> ToPort(const std::vector<std::string>& texts)
{
    std::vector<Port::StringBase<char>> result;
    for (const std::string& text : texts)
        result.push_back(ToPort(text));
    return result;
}

std::string Printable(const std::string& text)
{
    std::string result;
    for (char c : text) {
        if (c >= ' ' && c <= '~' && c != '\\') {
            result += c;
            continue;
        }
        char escape[8];
        std::snprintf(escape, sizeof escape, "\\x%02x",
                      static_cast<unsigned int>(static_cast<unsigned char>(c)));
        result += escape;
    }
    return result;
}

std::vector<reference::FlatNode> Flatten(const Node* root)
{
    std::vector<const Node*> order;
    std::vector<const Node*> pending;
    std::unordered_map<const Node*, int> positions;
    if (root)
        pending.push_back(root);
    while (!pending.empty()) {
        const Node* node = pending.back();
        pending.pop_back();
        order.push_back(node);
        if (!positions.emplace(node, static_cast<int>(order.size()) - 1).second)
            continue; // reached twice: not a tree, which the comparison reports
        if (node->GetRightChild())
            pending.push_back(node->GetRightChild());
        if (node->GetLeftChild())
            pending.push_back(node->GetLeftChild());
    }
    const auto positionOf = [&positions](const Node* node) {
        const auto found = positions.find(node);
        if (found != positions.end())
            return found->second;
        return node ? -2 : reference::kNone; // -2: a link out of the tree
    };
    std::vector<reference::FlatNode> flat;
    for (const Node* node : order)
        flat.push_back(reference::FlatNode{static_cast<int>(node->GetType()),
                                           ToStd(node->GetToken()), positionOf(node->GetParent()),
                                           positionOf(node->GetLeftChild()),
                                           positionOf(node->GetRightChild()), node->GetValue()});
    return flat;
}

std::string CompareMessages(const std::vector<reference::Message>& expected,
                            const std::vector<Captured>& actual)
{
    for (size_t position = 0; position < expected.size(); ++position) {
        if (expected[position].isFree) {
            // A free dump is the last thing a refused text prints.
            const bool areDumpPieces = std::all_of(
                actual.begin() + static_cast<std::ptrdiff_t>(std::min(position, actual.size())),
                actual.end(), IsNodeDumpPiece);
            return areDumpPieces ? "" : "something else among the pieces of a dump";
        }
        if (position >= actual.size())
            return "message " + std::to_string(position) +
                   " is missing: " + Describe(expected[position]);
        if (!Matches(expected[position], actual[position]))
            return "message " + std::to_string(position) + " should be " +
                   Describe(expected[position]) + " but is " + Describe(actual[position]);
    }
    if (actual.size() > expected.size())
        return "message " + std::to_string(expected.size()) +
               " is too much: " + Describe(actual[expected.size()]);
    return "";
}

std::string CompareTrees(const std::vector<reference::FlatNode>& expected,
                         const std::vector<reference::FlatNode>& actual)
{
    if (expected.size() != actual.size())
        return "tree should have " + std::to_string(expected.size()) + " nodes but has " +
               std::to_string(actual.size());
    for (size_t position = 0; position < expected.size(); ++position) {
        const reference::FlatNode& a = expected[position];
        const reference::FlatNode& b = actual[position];
        if (a.type != b.type || a.token != b.token || a.parent != b.parent || a.left != b.left ||
            a.right != b.right || a.value != b.value)
            return "node " + std::to_string(position) + " should be " + Describe(a) + " but is " +
                   Describe(b);
    }
    return "";
}

} // namespace support
