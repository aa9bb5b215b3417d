// Equations of look-up tables in a notation, and engineers' names for them: worked out once for
// each distinct function, then written over the nets of each table that has it. In: rows over pins,
// names of nets. Out: text, proved before the first use.  Fails: no text for a function without a
// short enough expression.
#ifndef BOOLEQ_INSPECT_EQUATION_TEXT_H
#define BOOLEQ_INSPECT_EQUATION_TEXT_H

#include <string>
#include <vector>

#include "design.h"
#include "rows.h"
#include "target.h"

namespace booleq {

// A text with places for inputs: pieces[0], then input inputs[0], then pieces[1] and so on.
struct TextWithInputs {
    std::vector<std::string> pieces; // one more than inputs
    std::vector<unsigned int> inputs;

    bool IsEmpty() const { return inputs.empty() && (pieces.empty() || pieces[0].empty()); }
};
std::string Fill(const TextWithInputs& text, const std::vector<std::string>& names);

struct FunctionTexts {
    std::string kind;        // "multiplexer"; empty for a function without a name
    TextWithInputs meaning;  // "multiplexer, select S: A for S=1; B for S=0"
    TextWithInputs equation; // empty if there is none
};

// The texts of a function whose inputs all matter.  Cost: a microsecond to some milliseconds.
// Threads: any.
FunctionTexts MakeTexts(const Rows& rows, const Target& target);

// Input names for functions without nets: A, B, C and so on.
std::vector<std::string> Letters(unsigned int numInputs);

// The name of a function over such inputs, and its short expression.
struct NamedFunction {
    std::string kind;
    std::string meaning;
    std::string equation;
};
NamedFunction NameFunction(const Rows& rows);

// Whether a target writes expressions; the others write files.
bool WritesExpressions(const Target& target);

// The name of a net as the target spells it. A name that it cannot spell is changed to one that no
// other net has.
std::string SpellNet(const Design& design, NetId net, const Target& target);

} // namespace booleq

#endif
