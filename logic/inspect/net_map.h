// Which net of one design is which of another one, as far as that is known: one numbering for the
// nets of both.
// Cost: a number for each net; by names a look-up for each.
#ifndef BOOLEQ_INSPECT_NET_MAP_H
#define BOOLEQ_INSPECT_NET_MAP_H

#include <string>
#include <utility>
#include <vector>

#include "name_match.h"

namespace booleq {

// A net of the left design and what the right one calls it, by paths.
typedef std::vector<std::pair<std::string, std::string>> Renames;

// Nets of the left design keep their numbers. One of the right design has that of the left net it
// is the same as, or one of its own, after those of the left.
// Invariant: m_rights and m_numbers say the same, and no two nets of a design are one of the other.
class NetMap {
  public:
    // Nothing is known but constants, and that open is open.
    NetMap(const Design& left, const Design& right);

    // From now on they are the same.  Requires: neither is known yet.
    void Join(NetId left, NetId right);

    bool IsKnownLeft(NetId left) const { return m_rights[left] != kNotThere; }
    bool IsKnownRight(NetId right) const { return m_numbers[right] < m_rights.size(); }
    // For a common number.
    bool IsKnown(NetId number) const
    {
        return number < m_rights.size() ? IsKnownLeft(number)
                                        : false; // a known right net has a left number
    }
    NetId NumberOfRight(NetId right) const { return m_numbers[right]; }
    bool IsLeft(NetId number) const { return number < m_rights.size(); }
    // The right net of a number of its own.
    NetId RightOf(NetId number) const { return number - static_cast<NetId>(m_rights.size()); }
    // kNotThere where it is not known.
    NetId RightOfLeft(NetId left) const { return m_rights[left]; }
    size_t NumKnown() const { return m_num_known; } // without constants

  private:
    std::vector<NetId> m_rights;  // of each left net
    std::vector<NetId> m_numbers; // of each right net
    size_t m_num_known = 0;
};

// What names say about which nets are the same.
struct NameJoins {
    Renames unused; // what could not be used of the renames
    // Nets with a name in common of which one is of no table: the name may have moved.
    std::vector<std::pair<NetId, NetId>> doubtful;
};

// Joins nets that 'renames' takes for one another, then those with a name in common, if tables of
// both designs have them.
NameJoins JoinByNames(const Design& left, const Design& right, const NameMatch& match,
                      const Renames& renames, NetMap& nets);

// The name to show for a common number.
std::string NumberName(const Design& left, const Design& right, const NetMap& nets, NetId number);

} // namespace booleq

#endif
