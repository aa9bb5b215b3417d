// The pool of names: a trie whose path spells a name and whose end holds it as a string.
// It never forgets and never moves a string.  Fails: std::bad_alloc, and the trie stays whole.
// Cost: one ordered-map search for each character, whatever the number of names.
#include <Kq_BoolEquationImp.h>

typedef Port::StringBase<char> String;

struct Kq_BoolEquationImp::StringMgr::StringMgrNode {
    std::map<char, StringMgrNode*> m_children; // owned
    const String* m_string = nullptr;          // owned; null until a name ends here
};

Kq_BoolEquationImp::StringMgr::StringMgr() : m_root(new StringMgrNode) {}

Kq_BoolEquationImp::StringMgr::~StringMgr()
{
    cleanup(m_root);
}

const String& Kq_BoolEquationImp::StringMgr::find(const char* name)
{
    StringMgrNode* node = m_root;
    const char* const text = name ? name : "";
    for (const char* character = text; *character; ++character) {
        // The slot is made first and filled second, so a failed allocation loses no node; an
        // unfilled slot is filled by the next search that comes by.
        StringMgrNode*& child = node->m_children[*character];
        if (!child)
            child = new StringMgrNode;
        node = child;
    }
    if (!node->m_string)
        node->m_string = new String(text);
    return *node->m_string;
}

// Frees 'node' and what is below it: children in map order, each before its parent. A name may be
// millions of characters long, so the way back up is kept in the tree: the map slot that led down
// holds the parent's parent until the walk returns. Nothing is allocated.
void Kq_BoolEquationImp::StringMgr::cleanup(StringMgrNode* node)
{
    StringMgrNode* parent = nullptr;
    while (node) {
        if (!node->m_children.empty()) {
            const auto slot = node->m_children.begin();
            StringMgrNode* child = slot->second;
            if (!child) {
                node->m_children.erase(slot);
                continue;
            }
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
