// Equations as text for other programs, read back and compared before they are returned.
//
//     const Kq_BoolEquation equation("a | b & c"); // operators group from the left
//     kq_logic::Conversion conversion = kq_logic::Convert(equation, "verilog");
//     std::cout << conversion.text; // (a | b) & c
//     conversion = kq_logic::Convert(equation, "html");
//     std::cout << conversion.fault.substr(0, 16) << '\n'; // no target 'html'
#ifndef KQ_LOGIC_CONVERT_H
#define KQ_LOGIC_CONVERT_H

#include <string>
#include <vector>

#include <kq_logic/function.h>
#include <kq_logic/limits.h>

namespace kq_logic {

// A text and how it spells the names.
struct Conversion {
    std::string fault;  // why there is no text; empty if there is one
    std::string text;   // ends with a line feed
    std::string unit;   // name of the module or other unit around the expression; empty: none
    std::string output; // name of its output
    std::vector<std::string> inputs; // of the equation
    std::vector<std::string> names;  // the spelling of each in the text
    bool saysNames = false;          // comments in the text explain changed names
    bool isProved = false;           // the text reads back as the same function
    std::string doubt;               // why that is not known; no difference was found
};

// "primary", "alt1", "verilog", "vhdl", "c", "python", "liberty", "blif", ...
KQ_EXPORT std::vector<std::string> ConversionTargets();

// 'unit' names a module, an entity, a function, a cell or a model to write around the expression.
// If it is empty, the expression is written alone, or as a model f if the target needs a unit.
// Fails: fault, if the equation is empty, the target is unknown or cannot express the equation;
// doubt, if the limit ends the comparison.
KQ_EXPORT Conversion Convert(const Kq_BoolEquation& equation, const std::string& target,
                             const std::string& unit = std::string(),
                             const Limits& limits = Limits());

} // namespace kq_logic

#endif
