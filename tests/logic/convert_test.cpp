// Texts for other notations: parentheses, names, and readers for what was written.
#include <gtest/gtest.h>

#include "convert.h"
#include "foreign_tree.h"
#include "logic_support.h"
#include "names.h"
#include "network.h"
#include "notation_writer.h"
#include "solver.h"

namespace {

using namespace booleq;
using namespace logic_support;

Conversion Converted(const Expression& expression, const char* target, const std::string& unit)
{
    return Convert(expression, *FindTarget(target), unit, {});
}

std::string To(const char* target, const std::string& text)
{
    const Conversion conversion = Converted(Parsed(text), target, "");
    EXPECT_EQ(conversion.fault, "");
    return conversion.text.substr(0, conversion.text.size() - 1);
}

TEST(Convert, WritesTheParenthesesOfEachPrecedence)
{
    const std::string text = "a | b & c ^ d";
    EXPECT_EQ(To("verilog", text), "(a | b) & c ^ d");
    EXPECT_EQ(To("c", text), "((a | b) & c) ^ d");
    EXPECT_EQ(To("liberty", text), "((a | b) & c) ^ d");
    EXPECT_EQ(To("vhdl", text), "((a or b) and c) xor d");
    EXPECT_EQ(To("python", text), "((a or b) and c) != d");
}

TEST(Convert, WritesOperatorsThatTheTargetLacksWithOthers)
{
    const std::string text = "(a ~& b) ~^ (c ~| ~d)";
    EXPECT_EQ(To("verilog", text), "~(a & b) ~^ ~(c | ~d)");
    EXPECT_EQ(To("c", text), "!(!(a & b) ^ !(c | !d))");
    EXPECT_EQ(To("python", text), "(not (a and b)) == (not (c or not d))");
    EXPECT_EQ(To("vhdl", text), "(a nand b) xnor (c nor not d)");
}

TEST(Convert, KeepsApartWhatTheTargetWouldJoin)
{
    EXPECT_EQ(To("verilog", "~~a"), "~(~a)");
    EXPECT_EQ(To("vhdl", "~~a"), "not (not a)");
    EXPECT_EQ(To("vhdl", "a ~& b ~& c"), "(a nand b) nand c");
    EXPECT_EQ(To("vhdl", "a & b & c"), "a and b and c");
    EXPECT_EQ(To("python", "a ^ b ^ c"), "(a != b) != c");
}

TEST(Names, AreSpelledOrChangedAndStayDifferent)
{
    const std::vector<std::string> inputs = {"'A'", "A", "'a'", "a", "'A[0]'", "and", "''", "'1'"};
    EXPECT_EQ(TargetNamer(&CNotation()).NameInputs(inputs),
              (std::vector<std::string>{"A_1", "A", "a_1", "a", "A_0", "and", "n", "n1"}));
    EXPECT_EQ(TargetNamer(&VerilogNotation()).NameInputs(inputs),
              (std::vector<std::string>{"A_1", "A", "a_1", "a", "\\A[0] ", "\\and ", "n", "\\1 "}));
    // Case does not matter, except for names between backslashes.
    EXPECT_EQ(TargetNamer(&VhdlNotation()).NameInputs(inputs),
              (std::vector<std::string>{"\\A\\", "A", "\\a\\", "a_1", "\\A[0]\\", "\\and\\", "n",
                                        "\\1\\"}));
}

TEST(Convert, RefusesATableOfTooManyInputs)
{
    std::string text = "v0";
    for (int input = 1; input <= 16; ++input)
        text += " & v" + std::to_string(input);
    EXPECT_NE(Converted(Parsed(text), "pla", "").fault, "");
    EXPECT_EQ(Converted(Parsed(text), "blif", "").fault, "");
    EXPECT_NE(Converted(Parsed("1"), "pla", "").fault, "");
}

TEST(Convert, ProvesTextsOfAnyNumberOfInputs)
{
    std::string text = "v0";
    for (int input = 1; input <= 40; ++input)
        text += std::string(input % 2 == 0 ? " ^ v" : " | v") + std::to_string(input);
    for (const char* target :
         {"verilog", "vhdl", "c", "python", "liberty", "blif", "eqn", "alt3"}) {
        const Conversion conversion = Converted(Parsed(text), target, "");
        EXPECT_EQ(conversion.fault, "");
        // Without a solver, only texts that group the operands in the same way are proved.
        if (Solver::IsThere())
            EXPECT_TRUE(conversion.isProved) << conversion.doubt;
        else
            EXPECT_EQ(conversion.isProved, conversion.doubt.find("no solver") == std::string::npos);
    }
}

TEST(Convert, TakesDeepExpressions)
{
    std::string text = "a";
    for (int level = 0; level < 50000; ++level)
        text = "b ^ (" + text;
    text += std::string(50000, ')');
    for (const char* target : {"verilog", "c", "vhdl", "blif", "eqn"})
        EXPECT_EQ(Converted(Parsed(text), target, "").fault, "") << target;
}

// What a notation reads: the column over the tree's names, or why it does not read the text.
std::string Seen(const Notation& notation, const std::string& text)
{
    ForeignTree tree;
    std::string fault;
    if (!Read(text, notation, tree, fault))
        return fault;
    const WordFunction function = ToWordFunction(tree);
    const auto numInputs = static_cast<unsigned int>(tree.names.size());
    std::vector<uint64_t> inputs;
    for (unsigned int input = 0; input < numInputs; ++input)
        inputs.push_back(InputWord(numInputs, input, 0));
    const uint64_t rows = function(inputs);
    std::string column;
    for (unsigned int row = 0; row < 1u << numInputs; ++row)
        column += (rows >> row & 1u) != 0 ? '1' : '0';
    return column;
}

TEST(Reader, GoesByTheNotationsPrecedence)
{
    EXPECT_EQ(Seen(VerilogNotation(), "a | b & c"), "00011111");
    EXPECT_EQ(Seen(LibertyNotation(), "a & b ^ c"), "00000110");
    EXPECT_EQ(Seen(CNotation(), "a & b ^ c"), "01010110");
    EXPECT_EQ(Seen(LibertyNotation(), "!a b'"), "1000");
    EXPECT_EQ(Seen(PythonNotation(), "not a == b"), "0110");
}

TEST(Reader, KnowsHowWideValuesAre)
{
    // "~" of the ints 0 and 1 is never 0; of a single bit it can be.
    EXPECT_EQ(Seen(CNotation(), "~a"), "11");
    EXPECT_EQ(Seen(PythonNotation(), "~a"), "11");
    EXPECT_EQ(Seen(VerilogNotation(), "~a"), "10");
    EXPECT_EQ(Seen(CNotation(), "~a & 1"), "10");
    // The sum of two ones is 2, and its lowest bit is 0.
    EXPECT_EQ(Seen(CNotation(), "a + b"), "0111");
    EXPECT_EQ(Seen(CNotation(), "(a + b) & 1"), "0110");
    EXPECT_EQ(Seen(VerilogNotation(), "a + b"), "0110");
    // A number makes its whole context 32 bits wide.
    EXPECT_EQ(Seen(VerilogNotation(), "!(a + b)"), "1001");
    EXPECT_EQ(Seen(VerilogNotation(), "!(a + b + 0)"), "1000");
    EXPECT_EQ(Seen(VerilogNotation(), "!(~a | 0)"), "00");
    EXPECT_EQ(Seen(VerilogNotation(), "!(~a | 1'b0)"), "01");
}

TEST(Reader, RefusesWhatTheNotationHasNot)
{
    EXPECT_EQ(Seen(CNotation(), "a ~& b"), "\"~\" at character 3 does not join two operands there");
    EXPECT_EQ(Seen(CNotation(), "(a"), "a parenthesis is not closed");
    EXPECT_EQ(Seen(CNotation(), "a)"), "a \")\" too many");
    EXPECT_EQ(Seen(CNotation(), "a &"), "the text ends where an operand must follow");
    EXPECT_EQ(Seen(CNotation(), ""), "the text ends where an operand must follow");
    EXPECT_EQ(Seen(CNotation(), "int & a"), "\"int\" is not a name there");
    EXPECT_EQ(Seen(PythonNotation(), "a @ b"), "\"@\" is for other values there");
    EXPECT_EQ(Seen(VhdlNotation(), "a and b or c"), "\"and\" and \"or\" need parentheses there");
    EXPECT_EQ(Seen(VhdlNotation(), "a nand b nand c"),
              "\"nand\" and \"nand\" need parentheses there");
    EXPECT_EQ(Seen(VerilogNotation(), "~~a"), "\"~\" cannot be repeated there without parentheses");
    EXPECT_EQ(Seen(PythonNotation(), "a == not b"), "\"not\" may not follow \"==\" there");
}

TEST(Reader, ShowsTheGroupingOfTheNotation)
{
    ForeignTree tree;
    std::string fault;
    ASSERT_TRUE(Read("a | b & !c ^ d", VerilogNotation(), tree, fault));
    EXPECT_EQ(WriteWhole(tree, tree.names), "(a | ((b & !c) ^ d))");
}

TEST(Network, IsReadOnlyWhereItIsWhole)
{
    Network network;
    EXPECT_TRUE(
        ReadBlif(".model f\n.inputs a b\n.outputs y\n.names a b y\n1- 1\n-1 1\n.end\n", network));
    EXPECT_FALSE(
        ReadBlif(".model f\n.inputs a b\n.outputs y\n.names a c y\n1- 1\n.end\n", network));
    EXPECT_FALSE(ReadBlif(".model f\n.inputs a\n.outputs z\n.names a y\n1 1\n.end\n", network));
    EXPECT_FALSE(ReadBlif(".model f\n.inputs a\n.outputs y\n.names a y\n1 1\n", network));
    EXPECT_FALSE(ReadPla(".i 2\n.o 1\n.ilb a b\n.ob y\n.p 1\n1 1\n.e\n", network));
    EXPECT_FALSE(ReadEqn("INORDER = a;\nOUTORDER = y;\ny = a * c;\n", network));
    EXPECT_FALSE(ReadEqn("", network));
}

} // namespace
