// An expression as text of a target, with names that the target can spell, the parentheses that it
// needs, and the proof that the text says the same.
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
    std::string fault; // if not empty: there is no text, and this is why
    std::string text;  // ends with a line end
    std::string unit;  // the name of module, entity, function, cell or model; may be empty
    std::string output;
    std::vector<std::string> names; // of the inputs, as the target spells them
    bool saysNames = false;         // the text has comments with the names that were changed
    bool isProved = false;          // the text says the same for all assignments
    std::string doubt;              // why that is not known; no difference was found
};

// Writes 'expression' for the target, reads the text back and compares the functions. 'unit' names
// what is put around it; "" asks for the bare expression if the target has one.
// Fails: fault, for a function that the target cannot hold or a text that does not read back;
// doubt, when the limits end the comparison.
Conversion Convert(const Expression& expression, const Target& target, const std::string& unit,
                   const Limits& limits);

// The inputs that have another name in the target, each with that name. 'names' are those of a
// conversion; they are empty if there is no text.
std::vector<std::pair<std::string, std::string>>
ChangedNames(const std::vector<std::string>& inputs, const std::vector<std::string>& names);

} // namespace booleq

#endif
