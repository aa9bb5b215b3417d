// Every text up to a size, library against the reference model: acceptance, messages, tree,
// renderings, variables and results. The numbers of accepted and refused texts are asserted, so
// that a loop that stops early cannot pass. Only the first differences are reported.
#include <gtest/gtest.h>

#include <functional>
#include <iostream>

#include "support/equation_compare.h"

namespace {

typedef std::vector<std::string> Texts;

const size_t kMaxReports = 5;

// Feeds texts to one pair of objects and counts.
class Checker {
  public:
    void Check(const std::string& text)
    {
        Count();
        Report(text, support::CompareSet(text, m_model, m_library, m_capture));
    }

    void Report(const std::string& text, const std::string& difference)
    {
        if (difference.empty())
            return;
        ++m_num_differences;
        if (m_num_differences <= kMaxReports)
            ADD_FAILURE() << "\"" << support::Printable(text) << "\": " << difference;
    }

    void ExpectCounts(size_t numAccepted, size_t numRefused)
    {
        Count();
        std::cout << "accepted " << m_num_accepted << ", refused " << m_num_refused << "\n";
        EXPECT_EQ(m_num_accepted, numAccepted);
        EXPECT_EQ(m_num_refused, numRefused);
        EXPECT_EQ(m_num_differences, 0u);
    }

    reference::Equation& Model() { return m_model; }
    Kq_BoolEquationImp& Library() { return m_library; }
    support::Capture& Messages() { return m_capture; }

    // Counts the text that the objects hold; code that checks a text by hand calls this itself.
    void Count()
    {
        if (m_has_text)
            ++(!m_model ? m_num_refused : m_num_accepted);
        m_has_text = true;
    }

  private:
    support::Capture m_capture;
    reference::Equation m_model;
    Kq_BoolEquationImp m_library;
    bool m_has_text = false;
    size_t m_num_accepted = 0;
    size_t m_num_refused = 0;
    size_t m_num_differences = 0;
};

// Calls 'visit' with every sequence of 'length' tokens, 'separator' between them.
void ForEachText(const Texts& alphabet, size_t length, const std::string& separator,
                 const std::function<void(const std::string&)>& visit)
{
    std::vector<size_t> digits(length, 0);
    for (;;) {
        std::string text;
        for (size_t position = 0; position < length; ++position)
            text += (position ? separator : "") + alphabet[digits[position]];
        visit(text);
        size_t position = 0;
        while (position < length && ++digits[position] == alphabet.size())
            digits[position++] = 0;
        if (position == length)
            return;
    }
}

void CheckAll(Checker& checker, const Texts& alphabet, size_t minLength, size_t maxLength,
              const std::string& separator)
{
    for (size_t length = minLength; length <= maxLength; ++length)
        ForEachText(alphabet, length, separator,
                    [&checker](const std::string& text) { checker.Check(text); });
}

// One spelling of each kind of token; the blank keeps "~" from joining with an operator.
const Texts kOneOfEachKind = {"A ", "B ", "1", "~ ", "&", "|", "(", ")"};
const Texts kOneBinaryOperator = {"A ", "~ ", "&", "(", ")"};
const Texts kAllOperators = {"A", "B", "0", "1", "~", "(", ")", "&", "|", "^", "~&", "~|", "~^"};
const Texts kAllSpellings = {
    "&",  "*",      ".AND.", "|",  "+",  ".OR.", "^",     "@",  ".XOR.", "~&",   "!&", "~*",
    "!*", ".NAND.", "~|",    "!|", "~+", "!+",   ".NOR.", "~^", "!^",    "~@",   "!@", ".NXOR.",
    "~",  "!",      ".NOT.", "(",  ")",  "0",    "1",     "A",  "_b2",   "'c d'"};

TEST(Exhaustive, UpToSixTokensOfEachKindAgree)
{
    Checker checker;
    CheckAll(checker, kOneOfEachKind, 1, 6, "");
    checker.ExpectCounts(1889, 297703);
}

TEST(Exhaustive, SevenTokensOfEachKindAgree)
{
    Checker checker;
    CheckAll(checker, kOneOfEachKind, 7, 7, "");
    checker.ExpectCounts(5844, 2091308);
}

TEST(Exhaustive, EightAndNineTokensWithOneBinaryOperatorAgree)
{
    Checker checker;
    CheckAll(checker, kOneBinaryOperator, 8, 9, "");
    checker.ExpectCounts(2806, 2340944);
}

TEST(Exhaustive, UpToFiveTokensWithEveryOperatorAgree)
{
    Checker checker;
    CheckAll(checker, kAllOperators, 1, 5, " ");
    checker.ExpectCounts(4036, 398197);
}

TEST(Exhaustive, UpToThreeTokensInEverySpellingAgree)
{
    Checker checker;
    CheckAll(checker, kAllSpellings, 1, 3, " ");
    checker.ExpectCounts(679, 39815);
}

TEST(Exhaustive, UpToThreeTokensInEverySpellingWithoutBlanksAgree)
{
    Checker checker;
    CheckAll(checker, kAllSpellings, 2, 3, "");
    checker.ExpectCounts(738, 39722);
}

TEST(Exhaustive, EveryTextOfOneByteAndOfTwoBytesAgrees)
{
    Texts bytes;
    for (int byte = 0; byte < 256; ++byte)
        bytes.push_back(std::string(1, static_cast<char>(byte)));
    Checker checker;
    CheckAll(checker, bytes, 1, 2, "");
    checker.ExpectCounts(3891, 61901);
}

TEST(Exhaustive, EveryTextOfSixCharactersAroundDotsAndQuotesAgrees)
{
    Checker checker;
    CheckAll(checker, {".", "OR", "N", "X", "'", "a", " ", "~", "1"}, 1, 6, "");
    checker.ExpectCounts(39913, 557957);
}

TEST(Exhaustive, UpToFiveTokensTraceAndDumpTheSameInDebugMode)
{
    Checker checker;
    support::DebugMode debugMode;
    for (size_t length = 1; length <= 5; ++length) {
        ForEachText(kOneOfEachKind, length, "", [&checker](const std::string& text) {
            checker.Check(text);
            checker.Model().Dbg();
            checker.Library().Dbg();
            checker.Report(text + " (dump)", support::CompareAndForgetMessages(checker.Messages()));
        });
    }
    checker.ExpectCounts(501, 36947);
}

const Texts kNames = {"A", "B", "C", "D"};

Texts FirstNames(size_t numNames)
{
    return Texts(kNames.begin(), kNames.begin() + static_cast<std::ptrdiff_t>(numNames));
}

// One init value over the first names, set without terms and with explicit terms, in all four
// orders.
void CheckInitValue(Checker& checker, size_t numNames, const std::string& text)
{
    checker.Model().Clear();
    checker.Library().Clear();
    for (const std::string& name : FirstNames(numNames)) {
        checker.Model().DefineVariable(name, 1);
        checker.Library().DefineVariable(support::ToPort(name), 1);
    }
    checker.Check(text);
    for (int flags = 0; flags < 4; ++flags) {
        const Texts names = FirstNames(numNames);
        const bool order = (flags & 1) != 0;
        const bool reverse = (flags & 2) != 0;
        checker.Count();
        const bool expected =
            checker.Model().SetEquationWithExplicitTerms(names, text, order, reverse);
        const bool actual = checker.Library().SetEquationWithExplicitTerms(
            support::ToPort(names), support::ToPort(text), order, reverse);
        checker.Report(text, expected == actual ? "" : "explicit terms: another result");
        checker.Report(text, support::CompareState(checker.Model(), checker.Library()));
        checker.Report(text, support::CompareResults(checker.Model(), checker.Library()));
        checker.Report(text, support::CompareAndForgetMessages(checker.Messages()));
    }
}

TEST(Exhaustive, BinaryInitValuesOfUpToNineDigitsOverUpToFourVariablesAgree)
{
    Checker checker;
    for (size_t numNames = 0; numNames <= 4; ++numNames) {
        for (size_t numDigits = 0; numDigits <= 9; ++numDigits) {
            if (numDigits == 0)
                CheckInitValue(checker, numNames, "0B");
            else
                ForEachText({"0", "1"}, numDigits, "", [&](const std::string& digits) {
                    CheckInitValue(checker, numNames, "0b" + digits);
                });
        }
    }
    checker.ExpectCounts(4089, 21486);
}

TEST(Exhaustive, HexInitValuesOfUpToTwoDigitsOverUpToFourVariablesAgree)
{
    Texts digits;
    for (char digit : std::string("0123456789abcdefABCDEFgG/:@`xX \n"))
        digits.push_back(std::string(1, digit));
    digits.push_back(std::string(1, '\0'));
    Checker checker;
    for (size_t numNames = 0; numNames <= 4; ++numNames) {
        for (const char* prefix : {"0x", "0X", "0y", "0 "}) {
            for (size_t numDigits = 1; numDigits <= 2; ++numDigits)
                ForEachText(digits, numDigits, "", [&](const std::string& text) {
                    CheckInitValue(checker, numNames, prefix + text);
                });
        }
    }
    checker.ExpectCounts(4348, 107852);
}

} // namespace
