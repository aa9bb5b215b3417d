// Expressions as text of a notation, with exactly the parentheses that its precedence needs.
#ifndef BOOLEQ_NOTATION_NOTATION_WRITER_H
#define BOOLEQ_NOTATION_NOTATION_WRITER_H

#include <string>
#include <vector>

#include "expression.h"
#include "notation.h"

namespace booleq {

// The library's own syntaxes. Its operators have one precedence and group from the left.
enum class OwnSyntax { AsTyped, First, Second, Third };

enum class Parentheses {
    Needed, // for this library
    Clear,  // wherever two operators meet, unless both are the same associative one
    Whole   // around every operation
};

// 'names' are those of the target, one for each input.
// An operator that the notation lacks is written with those that it has: a NAND as the inversion of
// an AND.  Cost: in step with the expression; no recursion.
std::string Write(const Expression& expression, const Notation& notation,
                  const std::vector<std::string>& names);

// Writes in a syntax of the library. A text of three or more characters never starts with "0",
// because it would be read as an init value if inputs are listed.
std::string WriteOwn(const Expression& expression, OwnSyntax syntax, Parentheses parentheses);

} // namespace booleq

#endif
