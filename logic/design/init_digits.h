// Init values as netlists spell them: 0xCA, 16'hcafe, 8'b1100_1010, 8'd202, 10xz1010 and bare
// digits. In: a text or a number, and the number of bits wanted; out: the bits and what was odd
// about them.
// Fails: false if the text is not a number.  Cost: linear in text and bits; for decimal digits,
// quadratic, but bounded.
#ifndef BOOLEQ_DESIGN_INIT_DIGITS_H
#define BOOLEQ_DESIGN_INIT_DIGITS_H

#include <cstdint>
#include <string_view>
#include <vector>

#include "cell_types.h"

namespace booleq {

struct InitDigits {
    std::vector<uint64_t> words;   // bits above numBits are 0
    std::vector<uint64_t> unknown; // as long as 'words'; 1 for x, z, ? digits, whose bits are 0
    bool hasUnknown = false;
    bool isShort = false; // the digits, or the size before them, give fewer bits than wanted
    bool isLong = false;  // they give more, not counting zeros that only complete a digit
};

// Digits without a prefix are read as 'bare' says. ByFormat means Binary if the digits are only 0,
// 1, x, z and as many as the bits wanted, Hex if they are a quarter as many, and a refusal
// otherwise.
// Requires: numBits > 0.  Reuses the memory of 'digits'.
bool ReadInitDigits(std::string_view text, BareDigits bare, uint32_t numBits, InitDigits& digits);
// A text of at most 64 digits, only 0 and 1, as a number; reads eight digits at a time.
// Fails: false for any other text.
bool ReadPlainBits(std::string_view text, uint64_t& value);
void ReadInitNumber(uint64_t number, uint32_t numBits, InitDigits& digits);

} // namespace booleq

#endif
