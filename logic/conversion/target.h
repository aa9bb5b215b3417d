// The table of conversion targets: everything in which they differ is in their rows.
#ifndef BOOLEQ_CONVERSION_TARGET_H
#define BOOLEQ_CONVERSION_TARGET_H

#include <string>
#include <vector>

#include "expression.h"
#include "network.h"
#include "notation.h"

namespace booleq {

// Whether a target never writes a module, an entity, a function or a cell around the expression,
// writes it when asked, or always writes a whole file.
enum class Wrapping { Never, Optional, Always };

// What reading a text back gives, over the inputs of what was written, in their order.
struct Reread {
    Expression expression; // from a text
    Network network;       // from a file
    bool isNetwork = false;
};

struct Target {
    const char* name;
    const Notation& (*notation)(); // null: names are the library's, or the file takes any
    Wrapping wrapping;
    // Fails: 'fault', for a function that the target cannot hold.
    std::string (*write)(const Expression& expression, const Target& target, const UnitNames& names,
                         std::string& fault);
    // Reads what 'write' wrote.  Fails: false.
    bool (*readAgain)(const std::string& text, const Target& target, const UnitNames& names,
                      Reread& reread);
    std::string (*wrap)(const std::string& text, const UnitNames& names); // null: as it is
    const char* commentStart;                                             // null: no comments
    const char* commentEnd;
};

// In the order in which they are listed for people.
const std::vector<Target>& Targets();
// Null for a word that is not a target.
const Target* FindTarget(const std::string& name);
// The target that writes expressions in the notation.  Requires: there is such a target.
const Target& TargetOf(const Notation& notation);
std::vector<std::string> TargetNames();

} // namespace booleq

#endif
