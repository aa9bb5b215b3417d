// Names of inputs as a target spells them, all different.
#ifndef BOOLEQ_NOTATION_NAMES_H
#define BOOLEQ_NOTATION_NAMES_H

#include <map>
#include <set>
#include <string>
#include <vector>

#include "notation.h"

namespace booleq {

// Gives out names that the target accepts and that are not in use yet.
class TargetNamer {
  public:
    // 'notation' is null for files of gates, whose names may have all but a few characters.
    explicit TargetNamer(const Notation* notation) : m_notation(notation) {}

    // One name for each input. A quoted name loses its quotes; if the rest is not a plain name, it
    // is escaped, or its other characters become "_". Plain names of other inputs come first, so
    // that A stays A and 'A' becomes A_1.
    std::vector<std::string> NameInputs(const std::vector<std::string>& inputs);
    // 'wanted', with a number after it if it is in use.
    std::string NameOther(const std::string& wanted);

  private:
    bool IsPlainName(const std::string& name) const;
    bool Claim(const std::string& spelled);
    std::string Spell(const std::string& content);

    const Notation* m_notation;
    std::set<std::string> m_used;                 // as the target tells names apart
    std::map<std::string, size_t> m_last_numbers; // added to a wanted name
};

} // namespace booleq

#endif
