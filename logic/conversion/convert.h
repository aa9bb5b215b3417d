// An expression as text of a target: names that the target can spell, needed parentheses, and the
// proof that what was written says the same.
#ifndef BOOLEQ_CONVERSION_CONVERT_H
#define BOOLEQ_CONVERSION_CONVERT_H

#include <string>
#include <utility>
#include <vector>

#include "expression.h"

namespace booleq {

enum class Target {
    Primary,
    Alt1,
    Alt2,
    Alt3,
    Paren,
    Verilog,
    Vhdl,
    C,
    Python,
    Liberty,
    Blif,
    Pla,
    Eqn
};

// All names of targets, in the order of the enumeration.
const std::vector<const char*>& TargetNames();
// Fails: false for a word that is no target.
bool FindTarget(const std::string& name, Target& target);
// Whether the target writes a module, an entity, a function or a cell around the expression when
// asked, a file in any case, or an expression only.
enum class Wrapping { Never, Optional, Always };
Wrapping WrappingOf(Target target);

struct Conversion {
    std::string fault; // not empty: there is no text, and why
    std::string text;  // ends with a line end
    std::string unit;  // the name of module, entity, function, cell or model; may be empty
    std::string output;
    std::vector<std::string> names; // of the inputs, as the target spells them
    bool saysNames = false;         // the text has comments with the names that were changed
    bool isExhaustive = false;      // all assignments were compared, or so many
    uint64_t numAssignments = 0;
};

// Writes 'expression' for the target, reads the text again and compares the functions. 'unit' names
// what is put around it: "" for the bare expression where the target has one.
// Fails: fault, for a function that the target cannot hold, or a text that does not read back.
Conversion Convert(const Expression& expression, Target target, const std::string& unit);

// The inputs whose name in the target is another one, each with that.
std::vector<std::pair<std::string, std::string>> ChangedNames(const Expression& expression,
                                                              const Conversion& conversion);

} // namespace booleq

#endif
