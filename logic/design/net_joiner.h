// Nets of a design that turn out to be one.
#ifndef BOOLEQ_DESIGN_NET_JOINER_H
#define BOOLEQ_DESIGN_NET_JOINER_H

#include <vector>

#include "design.h"

namespace booleq {

// Invariant: m_parents[net] <= net, so a chain of parents ends; a net beyond its end is its own.
class NetJoiner {
  public:
    // The nets are the same from now on. Open and unknown ones are never.
    void Join(NetId first, NetId second);
    // Its name is a tool's own: another one is shown where there is one.
    void Hide(NetId net);
    // Gives the nets that are one a common number, and the numbers that are free to others. The
    // names that are not shown become aliases.  Cost: in step with the design; nothing without a
    // join.
    void Apply(Design& design);

  private:
    NetId Root(NetId net);
    bool IsHidden(NetId net) const { return net < m_is_hidden.size() && m_is_hidden[net]; }

    std::vector<NetId> m_parents;
    std::vector<bool> m_is_hidden;
};

} // namespace booleq

#endif
