// Covers of one word of rows.
#include "small_cover.h"

#include <cassert>

namespace booleq {

namespace {

uint64_t Lower(uint64_t rows, size_t input)
{
    const uint64_t half = rows & ~BitPattern(input);
    return half | half << (size_t(1) << input);
}

uint64_t Upper(uint64_t rows, size_t input)
{
    const uint64_t half = rows & BitPattern(input);
    return half | half >> (size_t(1) << input);
}

// Covers 'needed' and nothing outside 'allowed'; returns the rows covered. Depth: 'numInputs'.
uint64_t Cover(uint64_t needed, uint64_t allowed, size_t numInputs, SmallCube prefix,
               std::vector<SmallCube>& cubes)
{
    assert((needed & ~allowed) == 0);
    if (needed == 0)
        return 0;
    if (allowed == ~uint64_t(0)) {
        cubes.push_back(prefix);
        return allowed;
    }
    size_t input = numInputs;
    do {
        assert(input > 0); // rows that are neither all 0 nor all 1 depend on an input
        --input;
    } while (Lower(needed, input) == Upper(needed, input) &&
             Lower(allowed, input) == Upper(allowed, input));
    const uint64_t neededLower = Lower(needed, input);
    const uint64_t neededUpper = Upper(needed, input);
    const uint64_t allowedLower = Lower(allowed, input);
    const uint64_t allowedUpper = Upper(allowed, input);
    SmallCube zero = prefix;
    zero.zeros = static_cast<uint8_t>(zero.zeros | 1u << input);
    SmallCube one = prefix;
    one.ones = static_cast<uint8_t>(one.ones | 1u << input);
    const uint64_t lower = Cover(neededLower & ~allowedUpper, allowedLower, input, zero, cubes);
    const uint64_t upper = Cover(neededUpper & ~allowedLower, allowedUpper, input, one, cubes);
    const uint64_t both = Cover((neededLower & ~lower) | (neededUpper & ~upper),
                                allowedLower & allowedUpper, input, prefix, cubes);
    return (lower & ~BitPattern(input)) | (upper & BitPattern(input)) | both;
}

} // namespace

void FindSmallCover(uint64_t rows, size_t numInputs, std::vector<SmallCube>& cubes)
{
    assert(numInputs <= kWordInputs);
    const uint64_t covered = Cover(rows, rows, numInputs, {0, 0}, cubes);
    assert(covered == rows);
    static_cast<void>(covered);
}

} // namespace booleq
