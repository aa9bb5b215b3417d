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
    // Everything is read before anything is cleared: the texts may be names that go.
    if (!KqInitText::IsCandidate(equation)) {
        std::vector<Variable> inputs = ListTerms(terms, false);
        Tokens tokens(equation.length());
        const bool isRead = ScanTokens(equation.c_str(), tokens);
        Clear();
        if (!isRead || tokens.GetSize() == 0)
            return false;
        m_variables.swap(inputs);
        return FinishEquation(tokens, nullptr);
    }
    // Deliberate: over listed inputs every text that starts with a 0 is an init value or refused,
    // "0&A" included.
    std::vector<Variable> inputs = ListTerms(terms, reverseTerms);
    std::unique_ptr<KqInitText> initText = KqInitText::Read(equation, inputs, termOrderFlag);
    Clear();
    if (!initText)
        return false;
    m_variables.swap(inputs);
    return FinishInitValue(std::move(initText));
}
