// The pool of names: a trie whose path spells a name and whose end holds it as a string.
// It never forgets and never moves a string.  Fails: std::bad_alloc, and the trie stays whole.
// A node stands for a run of characters and not for one: a name of ten million characters that
// shares no beginning with another is one node, where a node for each would take a gigabyte.
#include <Kq_BoolEquationImp.h>

#include <map>
#include <memory>
#include <string>

typedef Port::StringBase<char> String;

// Invariants:
// 1. The labels on the way down to a node, its own included, spell its string, when it has one.
// 2. A child's label is not empty, and its first character is the child's key.
struct Kq_BoolEquationImp::StringMgr::StringMgrNode {
    std::map<char, StringMgrNode*> m_children; // owned
    const String* m_string = nullptr;          // owned; null until a name ends here
    std::string m_label;                       // empty at the root only
};

namespace {

size_t CommonLength(const std::string& label, const char* text)
{
    size_t length = 0;
    while (length < label.size() && label[length] == text[length])
        ++length;
    return length;
}

} // namespace

Kq_BoolEquationImp::StringMgr::StringMgr() : m_root(new StringMgrNode) {}

Kq_BoolEquationImp::StringMgr::~StringMgr()
{
    cleanup(m_root);
}

const String& Kq_BoolEquationImp::StringMgr::find(const char* name)
{
    const char* const text = name ? name : "";
    const char* rest = text;
    StringMgrNode* node = m_root;
    while (*rest) {
        const auto slot = node->m_children.find(*rest);
        if (slot == node->m_children.end()) {
            std::unique_ptr<StringMgrNode> leaf(new StringMgrNode);
            leaf->m_label = rest;
            node->m_children.emplace(*rest, leaf.get());
            node = leaf.release();
            break;
        }
        StringMgrNode* child = slot->second;
        const size_t length = CommonLength(child->m_label, rest);
        if (length < child->m_label.size()) {
            // The name leaves the run here: a node of its own for the common beginning. All that
            // can fail comes before the trie changes.
            std::unique_ptr<StringMgrNode> upper(new StringMgrNode);
            upper->m_label.assign(child->m_label, 0, length);
            upper->m_children.emplace(child->m_label[length], child);
            child->m_label.erase(0, length);
            child = upper.release();
            slot->second = child;
        }
        node = child;
        rest += length;
    }
    if (!node->m_string)
        node->m_string = new String(text);
    return *node->m_string;
}

// Frees 'node' and what is below it: children in map order, each before its parent. The way back
// up is kept in the tree: the map slot that led down holds the parent's parent until the walk
// returns. So nothing is allocated, and depth costs nothing.
void Kq_BoolEquationImp::StringMgr::cleanup(StringMgrNode* node)
{
    StringMgrNode* parent = nullptr;
    while (node) {
        if (!node->m_children.empty()) {
            const auto slot = node->m_children.begin();
            StringMgrNode* child = slot->second;
            slot->second = parent;
            parent = node;
            node = child;
            continue;
        }
        delete node->m_string;
        delete node;
        node = parent;
        if (!node)
            return;
        const auto slot = node->m_children.begin();
        parent = slot->second;
        node->m_children.erase(slot);
    }
}
