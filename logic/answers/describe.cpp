#include "describe.h"

#include "kind.h"
#include "notation_writer.h"
#include "short_form.h"
#include "text.h"

namespace booleq {

Description Describe(const Function& function)
{
    Description description;
    if (function.NumInputs() > kMaxKindInputs) {
        description.fault = Count(function.NumInputs(), "input") + ": at most " +
                            std::to_string(kMaxKindInputs) + " are explained";
        return description;
    }
    const FunctionKind known = FindKind(function);
    description.idle = known.idle;
    description.kind = known.kind;
    description.text = known.text;
    const ShortForm shortForm = FindShortForm(function);
    if (shortForm.isFound) {
        description.expression =
            WriteOwn(shortForm.expression, OwnSyntax::First, Parentheses::Clear);
        description.numOperands = shortForm.numLiterals;
        description.isMinimal = shortForm.isMinimal;
    }
    return description;
}

} // namespace booleq
