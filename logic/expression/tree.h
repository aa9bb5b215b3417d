// The tree of an equation as a flat list, and as a graph for Graphviz.
#ifndef BOOLEQ_EXPRESSION_TREE_H
#define BOOLEQ_EXPRESSION_TREE_H

#include <cstddef>
#include <functional>
#include <string>
#include <vector>

#include <Kq_BoolEquation.h>

namespace booleq {

// The nodes in pre-order, left before right; a node's number is its place. A group is one node, and
// its ")" is left out. An init value is shown as the expression that it stands for.
// Requires: the equation is set, and does not change while its list is used.
// Cost: in step with the equation; no recursion.
class TreeList {
  public:
    static constexpr size_t kNoNode = static_cast<size_t>(-1);
    struct Entry {
        size_t depth;
        size_t parent;
        size_t left = kNoNode;
        size_t right = kNoNode;
    };

    explicit TreeList(const Kq_BoolEquation& equation);

    const std::vector<Entry>& Entries() const { return m_entries; }
    // "AND", "GROUP", ...
    std::string TypeName(size_t index) const;
    // As it was typed; "( )" for a group.
    std::string Token(size_t index) const;
    // For people: type and token of operators and groups; names and constants as typed.
    std::string Label(size_t index) const;
    bool IsName(size_t index) const;

  private:
    std::vector<Entry> m_entries;
    std::vector<const void*> m_nodes; // the engine's, one for each entry
};

// Writes the graph by calling 'put' with one piece after another.
void PutDot(const TreeList& list, const std::function<void(const std::string&)>& put);

} // namespace booleq

#endif
