#include "lut_texts.h"

#include <cassert>

#include "function.h"
#include "kind.h"
#include "notation_writer.h"
#include "parallel.h"
#include "short_form.h"

namespace booleq {

namespace {

constexpr size_t kPartSize = 16; // functions in a millisecond or so

LutText Describe(const Function& function)
{
    LutText text;
    FunctionKind kind = FindKind(function);
    text.kind = std::move(kind.kind);
    text.name = std::move(kind.text);
    const ShortForm found = FindShortForm(function);
    assert(found.isFound);
    text.shortForm = WriteOwn(found.expression, OwnSyntax::First, Parentheses::Clear);
    text.numLiterals = found.numLiterals;
    text.isMinimal = found.isMinimal;
    return text;
}

} // namespace

LutTexts DescribeLuts(const LutArray& luts, const std::vector<std::string>& inputs,
                      uint64_t* distinctPlaces, const LutWork& work)
{
    assert(inputs.size() == luts.numInputs);
    LutTexts result;
    result.distinct = FindDistinctLuts(luts, distinctPlaces);
    const std::vector<uint64_t>& words = result.distinct.words;
    const size_t wordsEach = NumWords(luts.numInputs);
    result.texts.resize(result.distinct.counts.size());
    RunInParts(result.texts.size(), kPartSize, work, [&](size_t begin, size_t end) {
        for (size_t place = begin; place < end; ++place) {
            const uint64_t* const table = words.data() + wordsEach * place;
            Rows rows(luts.numInputs, std::vector<uint64_t>(table, table + wordsEach));
            result.texts[place] = Describe(Function(inputs, std::move(rows)));
        }
    });
    return result;
}

} // namespace booleq
