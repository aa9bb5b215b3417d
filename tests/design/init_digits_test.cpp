// Init values in every spelling that occurs in netlists.
#include <gtest/gtest.h>

#include "init_digits.h"

namespace {

using booleq::BareDigits;

struct Row {
    const char* text;
    BareDigits bare;
    uint32_t numBits;
    uint64_t word;
    uint64_t unknown;
    const char* odd; // "short", "long" or ""
};

TEST(InitDigits, EverySpellingIsRead)
{
    const Row rows[] = {
        {"0xCA", BareDigits::Binary, 8, 0xca, 0, ""},
        {"0xca", BareDigits::ByFormat, 8, 0xca, 0, ""},
        {"0XcA", BareDigits::Hex, 8, 0xca, 0, ""},
        {"16'hCA", BareDigits::Binary, 16, 0xca, 0, ""},
        {"16'HcafE", BareDigits::Binary, 16, 0xcafe, 0, ""},
        {"8'b1100_1010", BareDigits::Binary, 8, 0xca, 0, ""},
        {"8'd202", BareDigits::Binary, 8, 0xca, 0, ""},
        {"8'o312", BareDigits::Binary, 8, 0xca, 0, ""},
        {"8'sb11001010", BareDigits::Binary, 8, 0xca, 0, ""},
        {"'hca", BareDigits::Binary, 8, 0xca, 0, ""},
        {"0b11001010", BareDigits::Binary, 8, 0xca, 0, ""},
        {"11001010", BareDigits::Binary, 8, 0xca, 0, ""},
        {"11001010", BareDigits::ByFormat, 8, 0xca, 0, ""},
        {"CA", BareDigits::ByFormat, 8, 0xca, 0, ""},
        {"ca", BareDigits::Hex, 8, 0xca, 0, ""},
        {"202", BareDigits::Decimal, 8, 0xca, 0, ""},
        {"18446744073709551615", BareDigits::Decimal, 64, UINT64_MAX, 0, ""},
        {" 0xca ", BareDigits::Binary, 8, 0xca, 0, ""},
        {"0x2", BareDigits::Binary, 2, 2, 0, ""},
        // Unknown digits.
        {"1x0z", BareDigits::Binary, 4, 8, 5, ""},
        {"4'b1x0Z", BareDigits::Binary, 4, 8, 5, ""},
        {"8'hcx", BareDigits::Binary, 8, 0xc0, 0x0f, ""},
        {"8'bx", BareDigits::Binary, 8, 0, 0xff, ""},
        {"0x10", BareDigits::Binary, 4, 2, 4, ""}, // as many digits as bits: x is one of them
        // More or fewer digits than bits.
        {"0xCA", BareDigits::Binary, 16, 0xca, 0, "short"},
        {"1010", BareDigits::Binary, 8, 0xa, 0, "short"},
        {"8'hCA", BareDigits::Binary, 16, 0xca, 0, "short"},
        {"0xCAFE", BareDigits::Binary, 8, 0xfe, 0, "long"},
        {"0x00CA", BareDigits::Binary, 8, 0xca, 0, "long"},
        {"16'hCA", BareDigits::Binary, 8, 0xca, 0, "long"},
        {"0x8", BareDigits::Binary, 2, 0, 0, "long"},
        {"256", BareDigits::Decimal, 8, 0, 0, "long"},
    };
    for (const Row& row : rows) {
        booleq::InitDigits digits;
        ASSERT_TRUE(ReadInitDigits(row.text, row.bare, row.numBits, digits)) << row.text;
        EXPECT_EQ(digits.words[0], row.word) << row.text;
        EXPECT_EQ(digits.unknown[0], row.unknown) << row.text;
        EXPECT_EQ(digits.hasUnknown, row.unknown != 0) << row.text;
        EXPECT_EQ(digits.isShort  ? "short"
                  : digits.isLong ? "long"
                                  : "",
                  std::string(row.odd))
            << row.text;
    }
}

TEST(InitDigits, WhatIsNotANumberIsRefused)
{
    for (const char* text : {"", " ", "0x", "0xg", "8'", "8'h", "8'q12", "'", "x'h1", "8'b2",
                             "0'h1", "on", "12 34", "-1", "8'h_", "1234567890'h1", "2", "cafe"}) {
        booleq::InitDigits digits;
        EXPECT_FALSE(ReadInitDigits(text, BareDigits::Binary, 8, digits)) << text;
    }
    booleq::InitDigits digits;
    EXPECT_FALSE(ReadInitDigits("101", BareDigits::ByFormat, 8, digits)); // of which base?
}

TEST(InitDigits, LongDecimalNumbersEqualTheirHexadecimalForm)
{
    booleq::InitDigits decimal;
    booleq::InitDigits hex;
    ASSERT_TRUE(
        ReadInitDigits("256'd115792089237316195423570985008687907853269984665640564039457584"
                       "007913129639935",
                       BareDigits::Binary, 256, decimal));
    ASSERT_TRUE(ReadInitDigits("0x" + std::string(64, 'f'), BareDigits::Binary, 256, hex));
    EXPECT_EQ(decimal.words, hex.words);
    EXPECT_FALSE(decimal.isLong);
}

} // namespace
