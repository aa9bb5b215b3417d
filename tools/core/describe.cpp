#include "describe.h"

#include "explain.h"
#include "minimise.h"
#include "text.h"
#include "writer.h"

namespace booleq {

Description Describe(const Function& function)
{
    Description description;
    if (function.NumInputs() > kMaxExplainInputs) {
        description.fault = Count(function.NumInputs(), "input") + ": at most " +
                            std::to_string(kMaxExplainInputs) + " are explained";
        return description;
    }
    const Explanation explanation = Explain(function);
    description.idle = explanation.idle;
    description.kind = explanation.kind;
    description.text = explanation.text;
    const Minimised minimised = Minimise(function);
    if (minimised.isFound) {
        description.expression =
            WriteOwn(minimised.expression, OwnSyntax::First, Parentheses::Clear);
        description.numOperands = minimised.numLiterals;
        description.isMinimal = minimised.isMinimal;
    }
    return description;
}

} // namespace booleq
