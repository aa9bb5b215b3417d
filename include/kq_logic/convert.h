// Equations as text for other programs, read again and compared before it is given out.
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

// A text and what it says.
struct Conversion {
    std::string fault;  // not empty: why there is no text
    std::string text;   // ends with a line end
    std::string unit;   // what is put around the expression bears this name; empty: nothing is
    std::string output; // the name of its output
    std::vector<std::string> inputs; // of the equation
    std::vector<std::string> names;  // how each is spelled in the text
    bool saysNames = false;          // comments in the text name the inputs that are spelled anew
    bool isProved = false;           // read again, the text says the same for all assignments
    std::string doubt;               // why that is not known; nothing was found against it
};

// "primary", "alt1", "verilog", "vhdl", "c", "python", "liberty", "blif", ...
KQ_EXPORT std::vector<std::string> ConversionTargets();

// 'unit' names a module, an entity, a function, a cell or a model around the expression. Without
// one it is written alone, or as a model f where a target has nothing smaller.
// Fails: fault, without an equation, for an unknown target, and for what a target cannot say;
// doubt, where a limit ends the comparison.
KQ_EXPORT Conversion Convert(const Kq_BoolEquation& equation, const std::string& target,
                             const std::string& unit = std::string(),
                             const Limits& limits = Limits());

} // namespace kq_logic

#endif
