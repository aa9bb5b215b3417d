// Which net of one design is which net of another, as far as that is known: one numbering for the
// nets of both.
// Cost: a number for each net; joining by names takes a look-up for each name.
#ifndef BOOLEQ_INSPECT_NET_MAP_H
#define BOOLEQ_INSPECT_NET_MAP_H

#include <string>
#include <utility>
#include <vector>

#include "name_match.h"

namespace booleq {

// Nets of the left design and what the right one calls them, as paths.
typedef std::vector<std::pair<std::string, std::string>> Renames;

// Nets of the left design keep their numbers. A net of the right design has the number of the left
// net that it is the same as, or else its own number, after all those of the left.
// Invariant: m_rights and m_numbers agree, and no two nets of a design are the same net of the
// other.
class NetMap {
  public:
    // Initially, only the fixed nets are known: constants, unknown and open.
    NetMap(const Design& left, const Design& right);

    // Makes the two nets the same.  Requires: neither is known yet.
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
    // The right net of a number that is not a left net's.
    NetId RightOf(NetId number) const { return number - static_cast<NetId>(m_rights.size()); }
    // kNotThere if it is not known.
    NetId RightOfLeft(NetId left) const { return m_rights[left]; }
    size_t NumKnown() const { return m_num_known; } // without the fixed nets

  private:
    std::vector<NetId> m_rights;  // of each left net
    std::vector<NetId> m_numbers; // of each right net
    size_t m_num_known = 0;
};

// What JoinByNames could not decide.
struct NameJoins {
    Renames unused; // the renames that could not be used
    // Pairs of nets with a common name of which one belongs to no table: the name may have moved.
    std::vector<std::pair<NetId, NetId>> doubtful;
};

// Joins the nets that 'renames' lists, then nets with a common name if tables of both designs use
// them.
NameJoins JoinByNames(const Design& left, const Design& right, const NameMatch& match,
                      const Renames& renames, NetMap& nets);

// The name to show for a common number.
std::string NumberName(const Design& left, const Design& right, const NetMap& nets, NetId number);

} // namespace booleq

#endif
