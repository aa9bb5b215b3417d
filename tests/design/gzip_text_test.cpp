// Netlists compressed by gzip, intact and damaged.
#include <cstdint>
#include <string>

#include <gtest/gtest.h>

#include "read_design.h"

namespace {

using namespace booleq;

std::string OfHex(const char* digits)
{
    std::string bytes;
    for (; digits[0] != 0; digits += 2)
        bytes += static_cast<char>(std::stoi(std::string(digits, 2), nullptr, 16));
    return bytes;
}

// Two members of one file: a model's head and its rest.
const std::string kHead = OfHex("1f8b0800000000000203d3cbcd4f49cd51c8e5d2cbcc2b282d2956485448e2d2cb"
                                "2f2d01732ab900fa1102b420000000");
const std::string kRest = OfHex("1f8b0800000000000203d3cb4bcc4d2d5648544852a8e432345430e4d24bcd4be1"
                                "0200cf81538a17000000");

class GzipText : public testing::Test {
  protected:
    void SetUp() override
    {
        if (FaultOf(kHead + kRest).find("this build has no zlib") != std::string::npos)
            GTEST_SKIP() << "a build without zlib";
    }

    // The fault; empty if the text is read.
    std::string FaultOf(const std::string& text)
    {
        std::string fault;
        const bool isRead = ReadDesignText(text, "test", ReadOptions(), m_design, fault);
        EXPECT_EQ(isRead, fault.empty());
        EXPECT_TRUE(isRead || m_design.tables.empty());
        return fault;
    }

    Design m_design;
};

TEST_F(GzipText, MembersOfAFileAreOneText)
{
    EXPECT_EQ(FaultOf(kHead + kRest), "");
    ASSERT_EQ(m_design.tables.size(), 1u);
    EXPECT_EQ(Path(m_design, m_design.tables[0].name), "y");
    EXPECT_EQ(m_design.tables[0].line, 4u);
    EXPECT_EQ(FaultOf(kHead), "test: line 3: the text ends inside model 'm', without .end");
}

// Cuts the file off at every place.
TEST_F(GzipText, AFileThatIsNotWholeIsRefused)
{
    const std::string whole = kHead + kRest;
    for (size_t size = 2; size < whole.size(); ++size)
        EXPECT_NE(FaultOf(whole.substr(0, size)), "") << size;
    EXPECT_EQ(FaultOf(whole.substr(0, 30)), "test: the compressed file is truncated");
    EXPECT_EQ(FaultOf(whole.substr(0, whole.size() - 1)), "test: the compressed file is truncated");
    EXPECT_EQ(FaultOf(whole.substr(0, 2)), "test: the compressed file is truncated");
}

// Flips every bit of the data and of its checksum; the name, time and system in the header do not
// matter.
TEST_F(GzipText, ADamagedFileIsRefused)
{
    const std::string whole = kHead + kRest;
    for (size_t place = 10; place < kHead.size(); ++place)
        for (unsigned int bit = 0; bit < 8; ++bit) {
            std::string damaged = whole;
            damaged[place] = static_cast<char>(damaged[place] ^ 1 << bit);
            EXPECT_NE(FaultOf(damaged), "") << place << " " << bit;
        }
    std::string damaged = whole;
    damaged[20] = static_cast<char>(~damaged[20]);
    EXPECT_EQ(FaultOf(damaged), "test: the compressed file is damaged");
}

TEST_F(GzipText, WhatFollowsIsNotSwallowed)
{
    EXPECT_EQ(FaultOf(kHead + kRest + "more"), "test: the compressed file is damaged");
    EXPECT_EQ(FaultOf(kHead + kRest + std::string(1, '\x1f')),
              "test: the compressed file is truncated");
}

TEST_F(GzipText, NothingAndWhatIsCompressedTwiceAreNoNetlists)
{
    EXPECT_EQ(FaultOf(OfHex("1f8b080000000000020303000000000000000000")), "test: it is empty");
    EXPECT_EQ(FaultOf(std::string("\x1f\x8b", 2) + std::string(100, 'x')),
              "test: the compressed file is damaged");
    std::string stored = OfHex("1f8b08000000000002030103"); // a stored block of 3 bytes
    stored += OfHex("00fcff1f8b08");
    EXPECT_NE(FaultOf(stored + std::string(8, '\0')), "");
}

} // namespace
