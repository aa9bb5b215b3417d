// Findings about texts: each is reported once in its place, and none without a cause.
#include <algorithm>
#include <random>

#include <gtest/gtest.h>

#include "foreign_tree.h"
#include "lint.h"
#include "notation_writer.h"
#include "solver.h"

namespace {

using namespace booleq;

LintReport Linted(const std::string& text, const std::vector<std::string>& inputs = {})
{
    Reading reading;
    reading.hasInputs = !inputs.empty();
    reading.inputs = inputs;
    Kq_BoolEquation equation;
    EXPECT_TRUE(SetFromText(equation, text, reading)) << text;
    return Lint(text, equation, reading, {});
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
    EXPECT_FALSE(verilog.decision.IsEqual());
    EXPECT_EQ(AssignmentText(report.inputs, verilog.decision.assignment), "a=1 b=0 c=0");
    EXPECT_FALSE(verilog.decision.left);
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
    // Between two operands the blank changes nothing, but the rendering still removes it.
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
    EXPECT_FALSE(ReadingOf(report, "C").decision.IsEqual());
    EXPECT_EQ(ReadingOf(report, "C").textThere, "!A");
    EXPECT_TRUE(ReadingOf(report, "Verilog").decision.IsEqual());
}

// "x0 & !x1 & x2 ...": 1 for one assignment of that many inputs.
std::string Literals(const std::string& name, int numInputs)
{
    std::string text;
    for (int input = 0; input < numInputs; ++input)
        text += std::string(input == 0 ? "" : " & ") + (input % 2 == 0 ? "" : "!") + name +
                std::to_string(input);
    return text;
}

TEST(Lint, SeesADifferenceThatNoSampleMeets)
{
    for (const int numLiterals : {20, 40}) {
        const LintReport report = Linted("(" + Literals("x", numLiterals) + ") | y & (" +
                                         Literals("z", numLiterals) + ")");
        ASSERT_EQ(report.inputs.size(), 2u * static_cast<size_t>(numLiterals) + 1);
        for (const char* name : {"Verilog", "C", "Liberty"}) {
            const Decision& decision = ReadingOf(report, name).decision;
            ASSERT_TRUE(decision.IsDifferent()) << name;
            EXPECT_NE(decision.left, decision.right);
        }
        EXPECT_FALSE(report.IsClean());
    }
}

TEST(Lint, ComputesWithNumbersOfAnyNumberOfInputs)
{
    // "+" adds: in Verilog two ones give 0, in C they do not.
    std::string sum = "v0";
    for (int input = 1; input < 40; ++input)
        sum += " + v" + std::to_string(input);
    const LintReport report = Linted(sum);
    EXPECT_TRUE(ReadingOf(report, "Verilog").decision.IsDifferent());
    const Decision& inC = ReadingOf(report, "C").decision;
    if (Solver::IsThere())
        EXPECT_TRUE(inC.IsEqual());
    else
        EXPECT_EQ(inC.verdict, Verdict::Undecided);
    EXPECT_TRUE(ReadingOf(report, "Liberty").decision.IsEqual());
}

TEST(Lint, SaysWhatItDoesNotDecide)
{
    std::string sums;
    for (int term = 0; term < 60; ++term)
        sums += (term == 0 ? "((v" : " ^ (v") + std::to_string(term) + " | v" +
                std::to_string((term * 7 + 3) % 60) + " & v" +
                std::to_string((term * 13 + 5) % 60) + ")";
    const std::string text = sums + ")";
    Kq_BoolEquation equation(text.c_str());
    const LintReport report = Lint(text, equation, Reading(), {1e-9});
    const Decision& decision = ReadingOf(report, "Verilog").decision;
    EXPECT_EQ(decision.verdict, Verdict::Undecided);
    EXPECT_TRUE(decision.isTimeOver);
    EXPECT_FALSE(report.IsClean());
    EXPECT_NE(ReadingOf(report, "Verilog").grouping, "");
}

std::string ReasonIn(const std::string& text, const std::string& notation)
{
    const LintReport report = Linted(text);
    return ReadingOf(report, notation).reason;
}

constexpr char kSumReason[] = "\"+\" adds there";
constexpr char kInversionReason[] =
    "\"~\" inverts every bit of a number there, so ~1 is -2, which counts as true";

TEST(Lint, NamesTheReasonThatAloneExplainsTheDifference)
{
    EXPECT_EQ(ReasonIn("a | b & ~c", "C"), "\"&\" binds tighter than \"|\" there");
    EXPECT_EQ(ReasonIn("a | b & ~c", "Python"), "\"&\" binds tighter than \"|\" there");
    EXPECT_EQ(ReasonIn("a + b * c", "C"), "\"*\" binds tighter than \"+\" there");
    EXPECT_EQ(ReasonIn("~A + B", "C"), kInversionReason);
    EXPECT_EQ(ReasonIn("~A + B", "Verilog"), kSumReason);
    EXPECT_EQ(ReasonIn("(a + b) * c", "Verilog"), kSumReason);
    EXPECT_EQ(ReasonIn("!(~a ^ 1)", "Verilog"),
              "0 and 1 are numbers of 32 bits there, and \"!\" asks for all of their bits");
}

TEST(Lint, NamesTwoReasonsWhereNoneExplainsAlone)
{
    EXPECT_EQ(ReasonIn("a + b * c", "Verilog"),
              std::string("\"*\" binds tighter than \"+\" there; ") + kSumReason);
    EXPECT_EQ(ReasonIn("a ^ b | c & d ^ ~e", "C"),
              std::string("\"&\" binds tighter than \"^\" there, and \"^\" tighter than \"|\"; ") +
                  kInversionReason);
}

// Whether 'notation' reads the text as the same function as this library.
bool Agrees(const std::string& text, const Notation& notation, const Expression& expression)
{
    ForeignTree tree;
    std::string fault;
    if (!Read(text, notation, tree, fault))
        return false;
    return Tabulate(ToWordFunction(tree), tree.names).Over(expression.names) ==
           ToFunction(expression);
}

TEST(Lint, BlamesGroupingAloneWhereParenthesesAloneHelp)
{
    std::mt19937_64 random(20);
    const std::string binaries[] = {"&", "|", "^", "+", "*"};
    size_t numGroupings = 0;
    size_t numOthers = 0;
    for (int round = 0; round < 3000; ++round) {
        std::string text;
        for (int operand = 0; operand < 5; ++operand) {
            if (operand > 0)
                text += " " + binaries[random() % 5] + " ";
            text += std::string(random() % 3 == 0 ? "~" : "") + static_cast<char>('a' + operand);
        }
        const LintReport report = Linted(text);
        Kq_BoolEquation equation(text.c_str());
        const Expression expression = ToExpression(equation);
        const std::string whole = WriteOwn(expression, OwnSyntax::AsTyped, Parentheses::Whole);
        for (const Notation* notation : ForeignNotations()) {
            const ForeignReading& reading = ReadingOf(report, notation->name);
            if (!reading.isRead || reading.decision.IsEqual())
                continue;
            const bool helps = Agrees(whole, *notation, expression);
            const bool isBlamedAlone = reading.reason.find("binds tighter") != std::string::npos &&
                                       reading.reason.find(';') == std::string::npos;
            EXPECT_EQ(isBlamedAlone, helps) << text << " in " << notation->name;
            ++(helps ? numGroupings : numOthers);
        }
    }
    EXPECT_GT(numGroupings, 1000u);
    EXPECT_GT(numOthers, 1000u);
}

} // namespace
