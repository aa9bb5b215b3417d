// The default host's message manager, memory and environment.
#include <cstdlib>
#include <stdexcept>
#include <string>
#include <vector>

#include <gtest/gtest.h>

#include <port/Port_Env.h>
#include <port/Port_MsgManData.h>
#include <port/Port_StringBase.h>
#include <port/mav_malloc.h>

namespace {

void Issue(const char* text)
{
    Port_MsgManData::createObject("Kq", "a file", 7, "a revision").issueStatus("%s", text);
}

// Restores the default sink, whatever a test does.
class Messages : public testing::Test {
  protected:
    ~Messages() override { Port_MsgManData::setSink(Port_MsgManData::Sink()); }

    Port_MsgManData::Sink Collect()
    {
        return [this](const char*, const char*, int, const char*, const char* text) {
            m_texts.push_back(text);
        };
    }

    std::vector<std::string> m_texts;
};

TEST_F(Messages, GoToStandardErrorAsTheyCome)
{
    testing::internal::CaptureStderr();
    Issue("no line end");
    Issue(", 100%\n");
    EXPECT_EQ(testing::internal::GetCapturedStderr(), "no line end, 100%\n");
}

TEST_F(Messages, CarryTheirOrigin)
{
    std::string origin;
    Port_MsgManData::setSink([&origin](const char* id, const char* file, int line,
                                       const char* revision, const char* text) {
        origin =
            std::string(id) + '|' + file + '|' + std::to_string(line) + '|' + revision + '|' + text;
    });
    Issue("text");
    EXPECT_EQ(origin, "Kq|a file|7|a revision|text");
}

TEST_F(Messages, OfAnyLengthArriveWhole)
{
    Port_MsgManData::setSink(Collect());
    for (const size_t length :
         {size_t(0), size_t(510), size_t(511), size_t(512), size_t(513), size_t(10000000)}) {
        const std::string text(length, 'x');
        Issue(text.c_str());
        EXPECT_EQ(m_texts.back(), text) << length;
    }
}

TEST_F(Messages, AreFormattedAsPrintfDoes)
{
    Port_MsgManData::setSink(Collect());
    Port_MsgManData::createObject("", "", 0, "").issueStatus("  %2d %-6s|%03d\n", 7, "ab", 5);
    EXPECT_EQ(m_texts.back(), "   7 ab    |005\n");
}

// A wide character without a byte sequence cannot be printed; a null format prints nothing.
#if !defined(_WIN32) // where the wide character is formatted as nothing
TEST_F(Messages, WhatCannotBeFormattedIsNotIssued)
{
    Port_MsgManData::setSink(Collect());
    Port_MsgManData& object = Port_MsgManData::createObject("", "", 0, "");
    const wchar_t wide[] = {static_cast<wchar_t>(0x7fffffff), 0};
    object.issueStatus("%ls", wide);
    const char* const format = nullptr;
    object.issueStatus(format);
    EXPECT_TRUE(m_texts.empty());
    object.issueStatus("%s", "text");
    EXPECT_EQ(m_texts, std::vector<std::string>{"text"});
}
#endif

TEST_F(Messages, NullOriginsCountAsEmpty)
{
    std::string origin = "not called";
    Port_MsgManData::setSink(
        [&origin](const char* id, const char* file, int, const char* revision, const char*) {
            origin = std::string(id) + file + revision;
        });
    Port_MsgManData::createObject(nullptr, nullptr, 0, nullptr).issueStatus("text");
    EXPECT_EQ(origin, "");
}

TEST_F(Messages, SetSinkReturnsTheOneBefore)
{
    EXPECT_FALSE(Port_MsgManData::setSink(Collect()));
    const Port_MsgManData::Sink first = Port_MsgManData::setSink(
        [](const char*, const char*, int, const char*, const char*) { FAIL(); });
    ASSERT_TRUE(first);
    EXPECT_TRUE(Port_MsgManData::setSink(first));
    Issue("to the first");
    EXPECT_EQ(m_texts, std::vector<std::string>{"to the first"});

    testing::internal::CaptureStderr();
    EXPECT_TRUE(Port_MsgManData::setSink(Port_MsgManData::Sink()));
    Issue("to standard error");
    EXPECT_EQ(testing::internal::GetCapturedStderr(), "to standard error");
}

TEST_F(Messages, ASinkKeepsItsState)
{
    std::string counts;
    Port_MsgManData::setSink(
        [&counts, count = 0](const char*, const char*, int, const char*, const char*) mutable {
            counts += std::to_string(++count);
        });
    Issue("");
    Issue("");
    Issue("");
    EXPECT_EQ(counts, "123");
}

TEST_F(Messages, ASinkMayThrow)
{
    Port_MsgManData::setSink([](const char*, const char*, int, const char*, const char*) {
        throw std::runtime_error("from the sink");
    });
    EXPECT_THROW(Issue(std::string(100000, 'x').c_str()), std::runtime_error);
    Port_MsgManData::setSink(Collect());
    Issue("after it");
    EXPECT_EQ(m_texts, std::vector<std::string>{"after it"});
}

TEST_F(Messages, ASinkMayIssueAMessage)
{
    Port_MsgManData::setSink(
        [this](const char*, const char*, int line, const char*, const char* text) {
            m_texts.push_back(std::to_string(line) + text);
            if (m_texts.size() == 1)
                Port_MsgManData::createObject("", "", 8, "").issueStatus("inner");
            m_texts.push_back(std::string("end ") + text);
        });
    Issue("outer");
    EXPECT_EQ(m_texts, (std::vector<std::string>{"7outer", "8inner", "end inner", "end outer"}));
}

// What a sink has captured must live until the sink returns.
TEST_F(Messages, ASinkMayReplaceItself)
{
    const std::string captured(1000, 'c');
    std::string seen;
    Port_MsgManData::setSink(
        [captured, &seen, this](const char*, const char*, int, const char*, const char*) {
            Port_MsgManData::setSink(Collect());
            seen = captured;
        });
    Issue("to the first");
    Issue("to the second");
    EXPECT_EQ(seen, captured);
    EXPECT_EQ(m_texts, std::vector<std::string>{"to the second"});
}

// Objects with static storage report before 'main' and after it; the second report shows only by
// not crashing.
struct Early {
    Early()
    {
        Port_MsgManData::Sink before =
            Port_MsgManData::setSink([this](const char*, const char*, int, const char*,
                                            const char* text) { m_text = text; });
        Issue("before main");
        Port_MsgManData::setSink(before);
    }
    ~Early() { Issue(""); }
    std::string m_text;
};
Early s_early;

TEST_F(Messages, MayComeFromStaticObjects)
{
    EXPECT_EQ(s_early.m_text, "before main");
}

TEST(Memory, IsGivenForEverySize)
{
    void* const none = mav_malloc(0);
    void* const some = mav_malloc(1000);
    EXPECT_NE(none, nullptr);
    EXPECT_NE(some, nullptr);
    mav_free(none);
    mav_free(some);
    mav_free(nullptr);
}

#if !defined(_WIN32) // where nothing can be set to the empty text
TEST(Environment, TellsSetFromUnset)
{
    ASSERT_EQ(setenv("KQ_PORT_TEST", "", 1), 0);
    EXPECT_STREQ(Port_Env::GetEnv("KQ_PORT_TEST"), "");
    ASSERT_EQ(unsetenv("KQ_PORT_TEST"), 0);
    EXPECT_EQ(Port_Env::GetEnv("KQ_PORT_TEST"), nullptr);
    EXPECT_EQ(Port_Env::GetEnv(nullptr), nullptr);
}
#endif

TEST(String, NullCountsAsEmpty)
{
    const char* const null = nullptr;
    Port::StringBase<char> text(null);
    text += null;
    text += "a";
    EXPECT_EQ(text.length(), 1u);
    text = null;
    EXPECT_STREQ(text.c_str(), "");
}

} // namespace
