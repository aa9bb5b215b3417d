// Why the library refuses a text, in words for a program's own messages.
#ifndef EXAMPLES_REFUSAL_WORDS_H
#define EXAMPLES_REFUSAL_WORDS_H

#include <string>

#include <Kq_BoolEquation.h>

namespace examples {

// What is wrong with the 'part' of the text that the refusal points at.
inline std::string Words(const Kq_BoolEquation::Refusal& refusal, const std::string& part)
{
    typedef Kq_BoolEquation::Refusal Refusal;
    switch (refusal.code) {
    case Refusal::NONE:
        return "accepted";
    case Refusal::EMPTY:
        return "there is no equation";
    case Refusal::CHARACTER:
        return "'" + part +
               "' is not part of the syntax; a name with other characters than "
               "letters, digits and '_' is written between single quotes";
    case Refusal::WORD:
        return part == "." ? "this '.' has no second one" : "'" + part + "' is not an operator";
    case Refusal::QUOTE:
        return "this quote has no second one";
    case Refusal::PAREN:
        return "'" + part + "' has no partner";
    case Refusal::OPERAND:
        return "'" + part + "' stands where an operator must";
    case Refusal::NO_LEFT_OPERAND:
        return "operator '" + part + "' has nothing on its left";
    case Refusal::NO_RIGHT_OPERAND:
        return "operator '" + part + "' has nothing on its right";
    case Refusal::NO_OPERAND:
        return "negation '" + part + "' has nothing to negate";
    case Refusal::NEGATED_OPERATOR:
        return "negation '" + part + "' stands apart from its operator, and there is no operand";
    case Refusal::INIT_DIGIT:
        return "'" + part + "' is not a digit of an init value";
    case Refusal::INIT_WIDTH:
        return "the init value has digits for another number of inputs";
    case Refusal::INIT_NAME:
        return "the name of an input makes the init value impossible to read";
    }
    return "refused, code " + std::to_string(refusal.code); // from a newer library
}

} // namespace examples

#endif
