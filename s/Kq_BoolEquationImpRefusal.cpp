// A refused text in, why and where out: what the tokenizer, the tree builder and the reading of
// init values have recorded, and nothing that they do not know. Fails: std::bad_alloc.  Cost: that
// of setting the equation, in memory too.
#include <Kq_BoolEquationImp.h>

#include <cstring>

#include "Kq_BoolEquationImpInitText.h"
#include "Kq_BoolEquationImpStore.h"

typedef Port::StringBase<char> String;
typedef Kq_BoolEquation::Refusal Refusal;

namespace {

Refusal MakeRefusal(Refusal::CODE code, size_t offset, size_t length)
{
    Refusal refusal;
    refusal.code = code;
    refusal.offset = offset;
    refusal.length = length;
    return refusal;
}

// Why a text that is read as an init value stands for no expression.
// Requires: KqInitText::IsCandidate(text).
Refusal FindInitRefusal(const String& text)
{
    const size_t position = KqInitText::FindBadDigit(text);
    if (position < text.length())
        return MakeRefusal(Refusal::INIT_DIGIT, position, 1);
    return MakeRefusal(Refusal::INIT_WIDTH, KqInitText::kPrefixLength,
                       text.length() - KqInitText::kPrefixLength);
}

} // namespace

Refusal Kq_BoolEquationImp::FindRefusal(const String& text, const std::vector<String>* terms)
{
    std::vector<Variable> inputs;
    if (terms)
        inputs = ListTerms(*terms, false);
    std::string expression;
    if (KqInitText::IsCandidate(text)) {
        const std::unique_ptr<KqInitText> initText = KqInitText::Read(text, inputs, false);
        if (initText && initText->IsExact())
            return Refusal();
        if (initText)
            expression = initText->Expand();
        else if (terms)
            return FindInitRefusal(text);
    }
    const bool isInitValue = !expression.empty();
    const char* const source = isInitValue ? expression.c_str() : text.c_str();
    Tokens tokens(std::strlen(source));
    Refusal refusal;
    if (ScanTokens(source, tokens, &refusal)) {
        if (tokens.GetSize() == 0)
            return MakeRefusal(Refusal::EMPTY, 0, text.length());
        const Kq_BoolEquationImp scratch;
        scratch.m_store->MakeNodes(tokens);
        size_t position = 0;
        refusal.code = scratch.FindTreeRefusal(position);
        if (refusal.code != Refusal::NONE)
            LocateToken(source, tokens, position, refusal);
    }
    // The expression of an init value is our own but for the names in it.
    if (isInitValue && refusal.code != Refusal::NONE)
        return MakeRefusal(Refusal::INIT_NAME, 0, text.length());
    return refusal;
}
