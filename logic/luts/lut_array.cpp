#include "lut_array.h"

#include <cassert>

namespace booleq {

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

} // namespace booleq
