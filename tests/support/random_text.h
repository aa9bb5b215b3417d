// Random equation texts: well-formed, mutated, malformed, raw bytes, init values.
// The same seed gives the same texts with every compiler.
#ifndef SUPPORT_RANDOM_TEXT_H
#define SUPPORT_RANDOM_TEXT_H

#include <cstdint>
#include <random>
#include <string>
#include <vector>

namespace support {

class RandomText {
  public:
    explicit RandomText(unsigned int seed) : m_engine(seed) {}

    // A number from 0 to limit - 1.  Requires: limit > 0.
    size_t Below(size_t limit) { return static_cast<size_t>(m_engine()) % limit; }
    uint32_t Any() { return static_cast<uint32_t>(m_engine()); }
    bool Chance(size_t percent) { return Below(100) < percent; }
    const std::string& OneOf(const std::vector<std::string>& texts)
    {
        return texts[Below(texts.size())];
    }

    // An expression of about 'numTokens' tokens over 'names', in a mixture of all spellings and
    // white space; with 'hasNegatedOperators' also "X ~ & Y".
    std::string WellFormed(size_t numTokens, const std::vector<std::string>& names,
                           bool hasNegatedOperators);
    // Any tokens in any order; usually as many opening as closing parentheses.
    std::string TokenSoup(size_t numTokens, const std::vector<std::string>& names);
    // 'text' with a few bytes removed, doubled, swapped or replaced.
    std::string Mutated(const std::string& text);
    // Bytes that have a meaning in equations, and any others, including NUL.
    std::string Bytes(size_t numBytes);
    // "0b" or "0x" and digits; only the prefix if 'numDigits' is 0.
    std::string BinaryInitValue(size_t numDigits);
    std::string HexInitValue(size_t numDigits);

  private:
    std::string Blank();
    std::string Operand(size_t& budget, size_t depth, const std::vector<std::string>& names,
                        bool hasNegatedOperators);
    std::string Chain(size_t& budget, size_t depth, const std::vector<std::string>& names,
                      bool hasNegatedOperators);

    std::mt19937 m_engine;
};

} // namespace support

#endif
