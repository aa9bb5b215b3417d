// Joins nets of a design that turn out to be the same.
#ifndef BOOLEQ_DESIGN_NET_JOINER_H
#define BOOLEQ_DESIGN_NET_JOINER_H

#include <vector>

#include "design.h"

namespace booleq {

// Invariant: m_parents[net] <= net, so a chain of parents ends. A net past the end of m_parents is
// its own parent.
class NetJoiner {
  public:
    // Makes the two nets the same.  Requires: neither is open or unknown.
    void Join(NetId first, NetId second);
    // Marks a net's name as made up by a tool: another name is shown if there is one.
    void Hide(NetId net);
    // Gives joined nets one number and renumbers all nets without gaps. Names that are not shown
    // become aliases.  Cost: linear in the design; nothing if no nets were joined.
    void Apply(Design& design);

  private:
    NetId Root(NetId net);
    bool IsHidden(NetId net) const { return net < m_is_hidden.size() && m_is_hidden[net]; }

    std::vector<NetId> m_parents;
    std::vector<bool> m_is_hidden;
};

} // namespace booleq

#endif
