#include "init_digits.h"

#include <algorithm>
#include <cassert>

namespace booleq {

namespace {

constexpr unsigned int kUnknownDigit = 16;
constexpr unsigned int kNoDigit = 17;
constexpr size_t kMaxSizeDigits = 9;

// The value of a digit of any base, kUnknownDigit for x, z and ?.
unsigned int DigitValue(char character)
{
    if (character >= '0' && character <= '9')
        return static_cast<unsigned int>(character - '0');
    const char lower = static_cast<char>(character | 0x20);
    if (lower >= 'a' && lower <= 'f')
        return static_cast<unsigned int>(lower - 'a') + 10;
    return lower == 'x' || lower == 'z' || character == '?' ? kUnknownDigit : kNoDigit;
}

bool IsDecimal(char character)
{
    return character >= '0' && character <= '9';
}

struct Literal {
    std::string_view digits;
    unsigned int bitsPerDigit = 0; // 0: decimal
    uint64_t size = 0;             // the number before the base; 0: none
};

void Clear(uint32_t numBits, InitDigits& digits)
{
    const size_t numWords = (numBits + size_t(63)) / 64;
    digits.words.assign(numWords, 0);
    digits.unknown.assign(numWords, 0);
    digits.hasUnknown = digits.isShort = digits.isLong = false;
}

// Writes one bit at a time, from the last digit. A bit that is too high makes the value too long
// unless it is 0.
class BitWriter {
  public:
    BitWriter(uint32_t numBits, InitDigits& digits) : m_num_bits(numBits), m_digits(digits) {}

    void Put(bool value, bool isUnknown)
    {
        const uint64_t place = m_place++;
        if (place >= m_num_bits) {
            m_digits.isLong |= value || isUnknown;
            return;
        }
        const auto word = static_cast<size_t>(place / 64);
        m_digits.words[word] |= uint64_t(value && !isUnknown) << (place % 64);
        m_digits.unknown[word] |= uint64_t(isUnknown) << (place % 64);
        m_digits.hasUnknown |= isUnknown;
    }

    uint64_t Place() const { return m_place; }

  private:
    uint64_t m_num_bits;
    uint64_t m_place = 0;
    InitDigits& m_digits;
};

// Fails: false for a character that is not a digit of the base.
bool ReadPowerOfTwo(const Literal& literal, uint32_t numBits, InitDigits& digits)
{
    BitWriter writer(numBits, digits);
    uint64_t numDigits = 0;
    unsigned int value = 0;
    for (size_t place = literal.digits.size(); place-- > 0;) {
        if (literal.digits[place] == '_')
            continue;
        value = DigitValue(literal.digits[place]);
        if (value == kNoDigit || (value != kUnknownDigit && value >> literal.bitsPerDigit != 0))
            return false;
        for (unsigned int bit = 0; bit < literal.bitsPerDigit; ++bit)
            writer.Put((value >> bit & 1u) != 0, value == kUnknownDigit);
        ++numDigits;
    }
    // If the size gives more bits than the digits do, the rest are zeros, or x if the first digit
    // is x.
    while (value == kUnknownDigit && writer.Place() < std::min<uint64_t>(literal.size, numBits))
        writer.Put(false, true);
    // A size gives the number of bits; without one, the number of digits does.
    const uint64_t perDigit = literal.bitsPerDigit;
    const uint64_t numSaid = literal.size != 0 ? literal.size : numDigits * perDigit;
    digits.isShort = numSaid < numBits;
    const uint64_t numFilled = (numBits + perDigit - 1) / perDigit * perDigit;
    digits.isLong |= numSaid > (literal.size != 0 ? numBits : numFilled);
    return numDigits != 0;
}

// words = words * 10 + value.  Returns what overflows the last word.
uint64_t MultiplyAdd(std::vector<uint64_t>& words, uint64_t value)
{
    uint64_t carry = value;
    for (uint64_t& word : words) {
        const uint64_t low = (word & UINT32_MAX) * 10 + carry;
        const uint64_t high = (word >> 32) * 10 + (low >> 32);
        word = high << 32 | (low & UINT32_MAX);
        carry = high >> 32;
    }
    return carry;
}

bool ReadDecimal(const Literal& literal, uint32_t numBits, InitDigits& digits)
{
    // A number of 2^16 bits has fewer than 20,000 digits; that bounds the quadratic cost.
    const size_t first = std::min(literal.digits.find_first_not_of("0_"), literal.digits.size());
    if (literal.digits.empty() || literal.digits.size() - first > 20000)
        return false;
    for (const char character : literal.digits) {
        if (character == '_')
            continue;
        if (!IsDecimal(character))
            return false;
        const auto value = static_cast<uint64_t>(character - '0');
        digits.isLong |= MultiplyAdd(digits.words, value) != 0;
    }
    if (numBits % 64 != 0) {
        const uint64_t mask = (uint64_t(1) << (numBits % 64)) - 1;
        digits.isLong |= (digits.words.back() & ~mask) != 0;
        digits.words.back() &= mask;
    }
    digits.isShort = literal.size != 0 && literal.size < numBits;
    digits.isLong |= literal.size > numBits;
    return true;
}

// Bits per digit of a base letter, 0 for decimal, 99 for none.
unsigned int BitsOfBase(char letter)
{
    switch (letter | 0x20) {
    case 'h':
        return 4;
    case 'o':
        return 3;
    case 'b':
        return 1;
    case 'd':
        return 0;
    default:
        return 99;
    }
}

// Splits 16'hcafe into its parts; the size may be missing, and an s may precede the base.
bool SplitSized(std::string_view text, size_t quote, Literal& literal)
{
    if (quote > kMaxSizeDigits ||
        !std::all_of(text.begin(), text.begin() + static_cast<long>(quote), IsDecimal))
        return false;
    for (const char character : text.substr(0, quote))
        literal.size = literal.size * 10 + static_cast<uint64_t>(character - '0');
    size_t base = quote + 1;
    if (base < text.size() && (text[base] | 0x20) == 's')
        ++base;
    if (base >= text.size() || (quote != 0 && literal.size == 0))
        return false;
    literal.bitsPerDigit = BitsOfBase(text[base]);
    literal.digits = text.substr(base + 1);
    return literal.bitsPerDigit <= 4;
}

bool IsBinaryText(std::string_view text)
{
    return std::all_of(text.begin(), text.end(), [](char character) {
        const unsigned int value = DigitValue(character);
        return value <= 1 || value == kUnknownDigit || character == '_';
    });
}

BareDigits FormOf(std::string_view text, BareDigits bare, uint32_t numBits)
{
    if (bare != BareDigits::ByFormat)
        return bare;
    return text.size() == numBits && IsBinaryText(text) ? BareDigits::Binary
           : text.size() == (numBits + 3) / 4           ? BareDigits::Hex
                                                        : BareDigits::ByFormat;
}

bool Split(std::string_view text, BareDigits bare, uint32_t numBits, Literal& literal)
{
    const size_t quote = text.find('\'');
    if (quote != std::string_view::npos)
        return SplitSized(text, quote, literal);
    if (text.size() > 2 && text[0] == '0' && ((text[1] | 0x20) == 'x' || (text[1] | 0x20) == 'b')) {
        // A Yosys string may begin with 0x, too: there x is a digit, and there are as many digits
        // as bits.
        const bool isYosys =
            bare != BareDigits::Hex && IsBinaryText(text) && text.size() == numBits;
        const bool isHex = (text[1] | 0x20) == 'x';
        const bool isPlainBinary = bare == BareDigits::Hex && !isHex; // 0b1 is then hexadecimal
        if (!isYosys && !isPlainBinary) {
            literal.bitsPerDigit = isHex ? 4 : 1;
            literal.digits = text.substr(2);
            return true;
        }
    }
    // A prefix without digits is refused, unless it can be two digits.
    if (text.size() == 2 && numBits != 2 && text[0] == '0' && !IsDecimal(text[1]) &&
        bare != BareDigits::Hex)
        return false;
    literal.digits = text;
    switch (FormOf(text, bare, numBits)) {
    case BareDigits::Binary:
        literal.bitsPerDigit = 1;
        return true;
    case BareDigits::Hex:
        literal.bitsPerDigit = 4;
        return true;
    case BareDigits::Decimal:
        literal.bitsPerDigit = 0;
        return true;
    case BareDigits::ByFormat:
        return false;
    }
    return false;
}

std::string_view Trimmed(std::string_view text)
{
    const size_t first = std::min(text.find_first_not_of(" \t\r\n"), text.size());
    text.remove_prefix(first);
    while (!text.empty() && (text.back() == ' ' || text.back() == '\t' || text.back() == '\r' ||
                             text.back() == '\n'))
        text.remove_suffix(1);
    return text;
}

} // namespace

bool ReadPlainBits(std::string_view text, uint64_t& value)
{
    if (text.empty() || text.size() > 64)
        return false;
    value = 0;
    size_t place = 0;
    for (; place + 8 <= text.size(); place += 8) {
        uint64_t digits = 0; // one in each byte, the first in the lowest byte
        for (unsigned int digit = 0; digit < 8; ++digit)
            digits |= uint64_t(static_cast<unsigned char>(text[place + digit])) << (8 * digit);
        digits ^= 0x3030303030303030;
        if ((digits & 0xfefefefefefefefe) != 0)
            return false;
        // Digit k goes to bit 63 - k: no two of the products overlap.
        value = value << 8 | (digits * 0x8040201008040201) >> 56;
    }
    for (; place < text.size(); ++place) {
        if (text[place] != '0' && text[place] != '1')
            return false;
        value = value << 1 | static_cast<uint64_t>(text[place] - '0');
    }
    return true;
}

bool ReadInitDigits(std::string_view text, BareDigits bare, uint32_t numBits, InitDigits& digits)
{
    assert(numBits != 0);
    Clear(numBits, digits);
    uint64_t bits = 0;
    if (bare == BareDigits::Binary && text.size() == numBits && ReadPlainBits(text, bits)) {
        digits.words[0] = bits;
        return true;
    }
    Literal literal;
    if (!Split(Trimmed(text), bare, numBits, literal))
        return false;
    return literal.bitsPerDigit == 0 ? ReadDecimal(literal, numBits, digits)
                                     : ReadPowerOfTwo(literal, numBits, digits);
}

void ReadInitNumber(uint64_t number, uint32_t numBits, InitDigits& digits)
{
    assert(numBits != 0);
    Clear(numBits, digits);
    const uint64_t mask = numBits >= 64 ? ~uint64_t(0) : (uint64_t(1) << numBits) - 1;
    digits.words[0] = number & mask;
    digits.isLong = (number & ~mask) != 0;
}

} // namespace booleq
