// A refused text in, why and where out: what the tokenizer, the tree builder and the reading of
// init values have recorded, and nothing more.
// Fails: std::bad_alloc.  Cost: that of setting the equation, in memory too.
#include <Kq_BoolEquationImp.h>

#include <cstring>

#include "Builder.h"
#include "Digits.h"
#include "Terms.h"
#include "Tokens.h"
#include "Tree.h"

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

// Why a text that is read as an init value does not stand for an expression.
// Requires: KqDigits::IsCandidate(text).
Refusal FindInitRefusal(const String& text)
{
    const size_t position = KqDigits::FindBadDigit(text);
    if (position < text.length())
        return MakeRefusal(Refusal::INIT_DIGIT, position, 1);
    return MakeRefusal(Refusal::INIT_WIDTH, KqDigits::kPrefixLength,
                       text.length() - KqDigits::kPrefixLength);
}

} // namespace

Refusal Kq_BoolEquationImp::FindRefusal(const String& text, const std::vector<String>* terms)
{
    std::vector<KqVariable> inputs;
    if (terms)
        inputs = KqListTerms(*terms, false);
    std::string expression;
    if (KqDigits::IsCandidate(text)) {
        const std::unique_ptr<KqDigits> digits = KqDigits::Read(text, inputs, false);
        if (digits && digits->IsExact())
            return Refusal();
        if (digits)
            expression = digits->Expand();
        else if (terms)
            return FindInitRefusal(text);
    }
    const bool isInitValue = !expression.empty();
    const char* const source = isInitValue ? expression.c_str() : text.c_str();
    KqTokens tokens(std::strlen(source));
    Refusal refusal;
    if (KqScanTokens(source, GetNamePool(), tokens, &refusal)) {
        if (tokens.GetSize() == 0)
            return MakeRefusal(Refusal::EMPTY, 0, text.length());
        KqTree scratch;
        scratch.MakeNodes(tokens);
        const KqBuildResult result = KqBuildTree(scratch.list, false);
        refusal.code = result.refusal;
        if (refusal.code != Refusal::NONE)
            KqLocateToken(source, tokens, result.refusedPosition, refusal);
    }
    // Only the names in an init value's expression are the caller's, so one of them is to blame.
    if (isInitValue && refusal.code != Refusal::NONE)
        return MakeRefusal(Refusal::INIT_NAME, 0, text.length());
    return refusal;
}
