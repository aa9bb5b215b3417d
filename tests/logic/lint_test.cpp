// Findings about texts: each once where it is, and none where nothing is.
#include <algorithm>

#include <gtest/gtest.h>

#include "lint.h"

namespace {

using namespace booleq;

LintReport Linted(const std::string& text, const std::vector<std::string>& inputs = {})
{
    Reading reading;
    reading.hasInputs = !inputs.empty();
    reading.inputs = inputs;
    Kq_BoolEquation equation;
    EXPECT_TRUE(SetFromText(equation, text, reading)) << text;
    return Lint(text, equation, reading);
}

std::vector<std::string> Codes(const LintReport& report)
{
    std::vector<std::string> codes;
    for (const Finding& finding : report.findings)
        codes.push_back(finding.code);
    return codes;
}

const ForeignReading& ReadingOf(const LintReport& report, const std::string& notation)
{
    return *std::find_if(report.readings.begin(), report.readings.end(),
                         [&](const ForeignReading& one) { return one.notation == notation; });
}

typedef std::vector<std::string> Words;

TEST(Lint, IsQuietWhereAllAgree)
{
    EXPECT_TRUE(Linted("A & B").IsClean());
    EXPECT_TRUE(Linted("(a | b) & c").IsClean());
    EXPECT_TRUE(Linted("0xca", {"S", "A", "B"}).IsClean());
}

TEST(Lint, TellsWhoGroupsDifferently)
{
    const LintReport report = Linted("a | b & c");
    EXPECT_FALSE(report.IsClean());
    const ForeignReading& verilog = ReadingOf(report, "Verilog");
    EXPECT_TRUE(verilog.isRead);
    EXPECT_FALSE(verilog.comparison.isEqual);
    EXPECT_EQ(AssignmentText(report.inputs, verilog.comparison.first), "a=1 b=0 c=0");
    EXPECT_FALSE(verilog.valueHere);
    EXPECT_EQ(report.grouping, "((a | b) & c)");
    EXPECT_EQ(verilog.grouping, "(a | (b & c))");
    EXPECT_EQ(verilog.textThere, "(a | b) & c");
    EXPECT_EQ(verilog.textHere, "a | (b & c)");
    EXPECT_EQ(verilog.hex, "0xf8");
    EXPECT_FALSE(ReadingOf(report, "VHDL").isRead);
}

TEST(Lint, FindsABlankThatChangesTheMeaning)
{
    EXPECT_EQ(Codes(Linted("P & X ~ | Y")), (Words{"blank", "unspaced-rendering"}));
    // Between two operands the blank changes nothing, but the rendering closes up all the same.
    EXPECT_EQ(Codes(Linted("X ~ | Y")), Words{});
    EXPECT_EQ(Codes(Linted("'a ~ | b' & Y")), Words{});
}

TEST(Lint, FindsRenderingsThatDoNotReadBack)
{
    const LintReport report = Linted("P & X ~ | Y & Q");
    EXPECT_EQ(Codes(report), (Words{"blank", "rendering", "unspaced-rendering"}));
}

TEST(Lint, FindsALeadingZero)
{
    const LintReport report = Linted("0 | A");
    ASSERT_EQ(Codes(report), Words{"leading-zero"});
    EXPECT_EQ(report.findings[0].details[0].second, "(0 | A)");
}

TEST(Lint, FindsInputsThatAreSkippedOrMissing)
{
    EXPECT_EQ(Codes(Linted("A & B", {"A", "B", "1x", "A"})),
              (Words{"skipped-input", "skipped-input"}));
    EXPECT_EQ(Codes(Linted("A & C", {"A", "B"})), Words{"unlisted-input"});
}

TEST(Lint, FindsAnInitValueThatIsTooShort)
{
    const LintReport report = Linted("0b10110", {"A", "B", "C"});
    ASSERT_EQ(Codes(report), Words{"short-init"});
    EXPECT_EQ(report.findings[0].message, "the init value gives 5 rows of 8; the others read as 1");
}

TEST(Lint, SaysWhatAnInversionOfNumbersIs)
{
    const LintReport report = Linted("~A");
    EXPECT_FALSE(ReadingOf(report, "C").comparison.isEqual);
    EXPECT_EQ(ReadingOf(report, "C").textThere, "!A");
    EXPECT_TRUE(ReadingOf(report, "Verilog").comparison.isEqual);
}

} // namespace
