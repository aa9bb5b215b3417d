#include "lut_array.h"

#include <algorithm>
#include <cassert>

#include "lut_word.h"
#include "parallel.h"

namespace booleq {

namespace {

constexpr size_t kPartSize = 65536;

} // namespace

LutArray LutsOf(const std::vector<uint64_t>& words, unsigned int numInputs)
{
    const bool isTwo = numInputs > 6;
    assert(!isTwo || words.size() % 2 == 0);
    return {words.data(), isTwo ? words.size() / 2 : words.size(), numInputs, isTwo ? 16u : 8u};
}

bool HasLutShape(unsigned int numInputs, unsigned int tableBytes)
{
    return numInputs <= kMaxLutInputs && tableBytes >= LutBytes(numInputs) &&
           (numInputs <= 6 ? tableBytes <= 8 : tableBytes == 16) &&
           (tableBytes & (tableBytes - 1)) == 0;
}

size_t FirstUncleanLut(const LutArray& luts, const LutWork& work)
{
    size_t first = kNoLut;
    WithLutWord(luts, [&](auto zero) {
        typedef decltype(zero) Word;
        const auto* const tables = static_cast<const Word*>(luts.tables);
        const Word outside = static_cast<Word>(~LutMask<Word>(luts.numInputs));
        first = FindFirstInParts(luts.count, kPartSize, work, [&](size_t begin, size_t end) {
            const Word* const found =
                std::find_if(tables + begin, tables + end,
                             [outside](Word table) { return (table & outside) != Word(); });
            return static_cast<size_t>(found - tables);
        });
    });
    return first;
}

} // namespace booleq
