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
    if (!KqInitText::IsCandidate(equation)) {
        Tokens tokens(equation.length());
        // Scanned before anything is cleared: the text may be one of the names that go.
        const bool isRead = ScanTokens(equation.c_str(), tokens);
        Clear();
        if (!isRead || tokens.GetSize() == 0)
            return false;
        DefineTerms(terms, false);
        return FinishEquation(tokens, nullptr);
    }
    // Deliberate: over listed inputs every text that starts with a 0 is an init value or refused,
    // "0&A" included.
    const String text = equation;
    Clear();
    DefineTerms(terms, reverseTerms);
    const std::string expression = KqInitText::Expand(text, GetVariableNames(), termOrderFlag);
    Tokens tokens(expression.length());
    if (expression.empty() || !ScanTokens(expression.c_str(), tokens)) {
        Clear();
        return false;
    }
    return FinishEquation(tokens, &text);
}
