// An expression as text of a target: names that the target can spell, needed parentheses, and the
// proof that what was written says the same.
#ifndef BOOLEQ_CONVERSION_CONVERT_H
#define BOOLEQ_CONVERSION_CONVERT_H

#include <string>
#include <utility>
#include <vector>

#include "deadline.h"
#include "expression.h"
#include "target.h"

namespace booleq {

struct Conversion {
    std::string fault; // not empty: there is no text, and why
    std::string text;  // ends with a line end
    std::string unit;  // the name of module, entity, function, cell or model; may be empty
    std::string output;
    std::vector<std::string> names; // of the inputs, as the target spells them
    bool saysNames = false;         // the text has comments with the names that were changed
    bool isProved = false;          // the text says the same for all assignments
    std::string doubt;              // why that is not known; nothing was found against it
};

// Writes 'expression' for the target, reads the text again and compares the functions. 'unit' names
// what is put around it: "" for the bare expression where the target has one.
// Fails: fault, for a function that the target cannot hold, or a text that does not read back;
// doubt, when the limits end the comparison.
Conversion Convert(const Expression& expression, const Target& target, const std::string& unit,
                   const Limits& limits);

// The inputs whose name in the target is another one, each with that. 'names' are those of a
// conversion; none where there is no text.
std::vector<std::pair<std::string, std::string>>
ChangedNames(const std::vector<std::string>& inputs, const std::vector<std::string>& names);

} // namespace booleq

#endif
