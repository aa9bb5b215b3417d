// Equations over listed inputs: the list fixes the order of the variables, and so the order of
// columns and of init-value bits.
// Fails: false with the object cleared, listed inputs included; std::bad_alloc.
#include <Kq_BoolEquationImp.h>

#include "Kq_BoolEquationImpInitText.h"
#include "Kq_BoolEquationImpStore.h"

typedef Port::StringBase<char> String;

bool Kq_BoolEquationImp::SetEquationWithExplicitTerms(const std::vector<String>& terms,
                                                      const String& equation, bool termOrderFlag,
                                                      bool reverseTerms)
{
    const String text = equation; // may be one of the names that are cleared now
    Clear();
    const bool isInitValue = KqInitText::IsCandidate(text);
    DefineTerms(terms, isInitValue && reverseTerms);
    if (!isInitValue) {
        TokenizeNodes(text.c_str());
        return FinishEquation(nullptr);
    }
    // Deliberate: over listed inputs every text that starts with a 0 is an init value or refused,
    // "0&A" included.
    const std::string expression = KqInitText::Expand(text, GetVariableNames(), termOrderFlag);
    if (expression.empty()) {
        Clear();
        return false;
    }
    TokenizeNodes(expression.c_str());
    return FinishEquation(&text);
}
