// The second library, only through its public headers: values, limits and refusals.
#include <chrono>
#include <random>

#include <gtest/gtest.h>

#include <kq_logic/convert.h>
#include <kq_logic/decide.h>
#include <kq_logic/explain.h>
#include <kq_logic/match.h>
#include <kq_logic/netlist_compare.h>
#include <kq_logic/permute.h>
#include <kq_logic/short_form.h>
#include <kq_logic/watch.h>

namespace {

using namespace kq_logic;

Function Of(const std::string& text)
{
    Function function;
    EXPECT_TRUE(function.Set(Kq_BoolEquation(text.c_str()))) << text;
    return function;
}

// "v0 ^ v1 ^ ..."
std::string Parity(size_t numInputs)
{
    std::string text = "v0";
    for (size_t input = 1; input < numInputs; ++input)
        text += " ^ v" + std::to_string(input);
    return text;
}

TEST(LogicFunction, IsTheLibrarysColumn)
{
    for (const char* text : {"A & ~B", "a", "'x y' ^ b ^ c ^ d ^ e ^ f ^ g", "1"}) {
        const Kq_BoolEquation equation(text);
        Function function;
        ASSERT_TRUE(function.Set(equation));
        std::vector<uint64_t> words;
        ASSERT_TRUE(equation.GetColumn(words));
        ASSERT_EQ(function.NumWords(), words.size());
        EXPECT_EQ(std::vector<uint64_t>(function.Words(), function.Words() + words.size()), words);
        EXPECT_EQ(function.NumInputs(), equation.GetNumVariables());
        for (size_t row = 0; row < function.NumRows(); ++row)
            EXPECT_EQ(function.At(row), (words[row / 64] >> (row % 64) & 1u) != 0);
        Function again;
        ASSERT_TRUE(again.Set(function.Inputs(), words));
        EXPECT_TRUE(again == function);
    }
}

TEST(LogicFunction, StaysAsItWasWhenRefused)
{
    Function function = Of("A & B");
    EXPECT_FALSE(function.Set(Kq_BoolEquation()));
    EXPECT_FALSE(function.Set(Kq_BoolEquation(Parity(31).c_str())));
    EXPECT_FALSE(function.Set({"A", "A"}, {1}));
    EXPECT_FALSE(function.Set({"A"}, {4})); // a bit after the last row
    EXPECT_FALSE(function.Set({"A"}, {}));
    EXPECT_FALSE(function.Set({"A"}, {1, 0}));
    EXPECT_FALSE(function.Set(std::vector<std::string>(31, "A"), {1}));
    EXPECT_EQ(function.Hex(), "0x8");
    const Function copy = function;
    ASSERT_TRUE(function.Set({"A"}, {2}));
    EXPECT_EQ(copy.Binary(), "0b1000");
    EXPECT_NE(copy, function);
}

TEST(LogicQuestions, SayWhenThereAreTooManyInputs)
{
    const Function large = Of(Parity(17));
    EXPECT_EQ(Explain(large).fault, "17 inputs: at most 16 are explained");
    EXPECT_NE(FindShortForm(large).fault, "");
    EXPECT_EQ(Match(Of("A"), large, MatchScope::Order).fault, "17 inputs: at most 16 are matched");
    Function permuted;
    EXPECT_EQ(Permute(Of("A"), {"A", "A"}, permuted), "A is listed twice");
    EXPECT_NE(Permute(Of("A"), {"A", "1x"}, permuted), "");
    EXPECT_NE(Permute(Of("A & B"), {"A"}, permuted), "");
}

TEST(LogicQuestions, AnswerWithFunctionsThatAreEqual)
{
    std::mt19937_64 random(11);
    for (int repeat = 0; repeat < 200; ++repeat) {
        const std::vector<std::string> inputs = {"a", "b", "c", "d", "e"};
        Function function;
        ASSERT_TRUE(function.Set(inputs, {random() & 0xffffffff}));
        const ShortForm shortForm = FindShortForm(function);
        ASSERT_EQ(shortForm.fault, "");
        Function shortened = Of(shortForm.text);
        ASSERT_EQ(Permute(shortened, inputs, shortened), "");
        ASSERT_TRUE(shortened == function) << shortForm.text;

        Function turned;
        ASSERT_EQ(Permute(function, {"c", "e", "a", "d", "b"}, turned), "");
        ASSERT_TRUE(turned.Set(inputs, {*turned.Words()}));
        const Matching matching = Match(function, turned, MatchScope::Order);
        ASSERT_TRUE(matching.isFound);
        ASSERT_TRUE(Apply(matching, function, inputs) == turned);
        const Explanation explanation = Explain(function);
        ASSERT_EQ(explanation.mattering.size() + explanation.idle.size(), inputs.size());
    }
}

TEST(LogicConvert, WritesEveryTargetOrSaysWhyNot)
{
    const Kq_BoolEquation equation("a | b & ~'c d'");
    for (const std::string& target : ConversionTargets()) {
        const Conversion conversion = Convert(equation, target, "gate");
        EXPECT_EQ(conversion.fault, "") << target;
        EXPECT_TRUE(conversion.isProved) << target;
        EXPECT_EQ(conversion.text.back(), '\n') << target;
        EXPECT_EQ(conversion.inputs.size(), 3u);
        EXPECT_EQ(conversion.names.size(), 3u);
    }
    EXPECT_NE(Convert(Kq_BoolEquation(), "c").fault, "");
    EXPECT_NE(Convert(equation, "").fault, "");
    EXPECT_NE(Convert(Kq_BoolEquation(Parity(17).c_str()), "pla").fault, "");
}

TEST(LogicDecide, FindsADifferenceThatIsOne)
{
    const Kq_BoolEquation left("a | b & c");
    const Kq_BoolEquation right("a | (b & c)");
    const Decision decision = DecideEqual(left, right);
    ASSERT_EQ(decision.verdict, Verdict::Different);
    ASSERT_EQ(decision.assignment.size(), decision.inputs.size());
    for (const bool isLeft : {true, false}) {
        Kq_BoolEquation equation(isLeft ? left : right);
        for (size_t input = 0; input < decision.inputs.size(); ++input)
            equation.SetVariable(decision.inputs[input].c_str(), decision.assignment[input]);
        EXPECT_EQ(equation.Eval() != 0, isLeft ? decision.left : decision.right);
    }
    EXPECT_NE(decision.left, decision.right);
    EXPECT_EQ(DecideEqual(left, Kq_BoolEquation("c & (b | a)")).verdict, Verdict::Equal);
    EXPECT_EQ(DecideConstant(Kq_BoolEquation("a & ~a"), false).verdict, Verdict::Equal);
    EXPECT_EQ(DecideConstant(left, true).verdict, Verdict::Different);
    EXPECT_EQ(DecideEqual(left, Kq_BoolEquation()).verdict, Verdict::Undecided);
    EXPECT_FALSE(DecideEqual(left, Kq_BoolEquation()).isTimeOver);
}

// An init value of 20 inputs is an expression of a million terms, and a column of 128 KB.
TEST(LogicDecide, InitValuesByTheirColumns)
{
    std::vector<Port::StringBase<char>> names;
    std::string conjunction;
    for (size_t input = 0; input < 20; ++input) {
        names.push_back(("i" + std::to_string(input)).c_str());
        conjunction += (input == 0 ? "i" : " & i") + std::to_string(input);
    }
    std::string digits = "0x" + std::string(size_t(1) << 18, '0');
    digits[2] = '8';
    Kq_BoolEquation value;
    ASSERT_TRUE(value.SetEquationWithExplicitTerms(names, digits.c_str(), false, false));
    const auto start = std::chrono::steady_clock::now();
    EXPECT_EQ(DecideEqual(value, Kq_BoolEquation(conjunction.c_str())).verdict, Verdict::Equal);
    EXPECT_EQ(DecideConstant(value, true).verdict, Verdict::Different);
    EXPECT_TRUE(DecideConstant(value, false).assignment == std::vector<bool>(20, true));
    EXPECT_LT(std::chrono::steady_clock::now() - start, std::chrono::seconds(5));
}

TEST(LogicFunction, TellsWhichInputsMatter)
{
    Function function;
    ASSERT_TRUE(function.Set(Kq_BoolEquation("a & (b | ~b) ^ c")));
    EXPECT_TRUE(function.DependsOn(0));
    EXPECT_FALSE(function.DependsOn(1));
    EXPECT_TRUE(function.DependsOn(2));
}

std::string Blif(const std::string& cover)
{
    return ".model m\n.inputs a b\n.outputs y\n.names a b y\n" + cover + "\n.end\n";
}

kq_logic::Netlist ReadNetlist(const std::string& text)
{
    kq_logic::Netlist netlist;
    std::string fault;
    EXPECT_TRUE(netlist.ReadText(text, fault)) << fault;
    return netlist;
}

TEST(KqLogicNetlist, ATableIsAPlainValue)
{
    const kq_logic::Netlist netlist = ReadNetlist(Blif("10 1"));
    ASSERT_EQ(netlist.NumTables(), 1u);
    const kq_logic::NetlistTable table = netlist.At(0);
    EXPECT_EQ(table.path, "y");
    EXPECT_EQ(table.output, "y");
    EXPECT_EQ(table.inputs, (std::vector<std::string>{"b", "a"}));
    EXPECT_EQ(table.init, "0x2");
}

TEST(KqLogicNetlist, ADifferenceHasItsCause)
{
    const kq_logic::NetlistComparison comparison =
        Compare(ReadNetlist(Blif("10 1")), ReadNetlist(Blif("01 1")));
    EXPECT_FALSE(comparison.isSame);
    EXPECT_EQ(comparison.numSame, 0u);
    ASSERT_EQ(comparison.differences.size(), 1u);
    const kq_logic::TableDifference& difference = comparison.differences[0];
    ASSERT_FALSE(difference.causes.empty());
    EXPECT_EQ(difference.causes[0].first, "pins-swapped");
    EXPECT_EQ(difference.shouldBe, "0x2");
    EXPECT_NE(difference.left, difference.right);
    EXPECT_EQ(difference.assignment.size(), 2u);
}

TEST(KqLogicNetlist, ARefusedTextLeavesTheNetlistAsItWas)
{
    kq_logic::Netlist netlist = ReadNetlist(Blif("11 1"));
    std::string fault;
    EXPECT_FALSE(netlist.ReadText("nonsense", fault));
    EXPECT_NE(fault, "");
    EXPECT_EQ(netlist.NumTables(), 1u);
    EXPECT_TRUE(Compare(netlist, ReadNetlist(Blif("11 1"))).isSame);
    EXPECT_EQ(kq_logic::Netlist().NumTables(), 0u);
}

TEST(KqLogicNetlist, TablesOfAWidthAreArrays)
{
    const kq_logic::Netlist netlist = ReadNetlist(
        ".model m\n.inputs a b c\n.outputs x y\n.names a b x\n11 1\n.names x a c y\n1-1 1\n.end\n");
    EXPECT_EQ(netlist.Widths(), (std::vector<unsigned int>{2, 3}));
    EXPECT_EQ(netlist.Types(), (std::vector<std::string>{".names"}));
    EXPECT_EQ(netlist.Top(), "m");
    EXPECT_EQ(netlist.Format(), "BLIF");
    size_t numTables = 0;
    for (const unsigned int width : netlist.Widths()) {
        const kq_logic::NetlistArrays arrays = netlist.Arrays(width);
        ASSERT_EQ(arrays.tables.size(), 1u);
        ASSERT_EQ(arrays.inputs.size(), width);
        const kq_logic::NetlistTable table = netlist.At(arrays.tables[0]);
        EXPECT_EQ(netlist.PathAt(arrays.tables[0]), table.path);
        EXPECT_EQ(netlist.NetAt(arrays.outputs[0]), table.output);
        EXPECT_EQ(arrays.lines[0], table.line);
        for (unsigned int input = 0; input < width; ++input)
            EXPECT_EQ(netlist.NetAt(arrays.inputs[input]), table.inputs[input]);
        Function function;
        ASSERT_TRUE(function.Set(table.inputs, arrays.words));
        EXPECT_EQ(function.Hex(), table.init);
        ++numTables;
    }
    EXPECT_EQ(numTables, netlist.NumTables());
    EXPECT_TRUE(netlist.Arrays(16).tables.empty());
    EXPECT_TRUE(netlist.Arrays(1000).tables.empty());
}

TEST(KqLogicNetlist, WhatItIsMadeOfIsCounted)
{
    const kq_logic::NetlistStats stats = ReadNetlist(Blif("1- 1")).Stats();
    EXPECT_EQ(stats.numTables, 1u);
    EXPECT_EQ(stats.numWires, 1u);
    EXPECT_EQ(stats.numIdle, 1u);
    EXPECT_EQ(stats.byPins, (std::vector<uint64_t>{0, 0, 1}));
    EXPECT_EQ(stats.byInputs, (std::vector<uint64_t>{0, 1}));
    ASSERT_EQ(stats.commonest.size(), 1u);
    EXPECT_EQ(stats.commonest[0].function.Hex(), "0x2");
    ASSERT_EQ(stats.types.size(), 1u);
    EXPECT_EQ(stats.types[0].role, "table");
}

TEST(KqLogicNetlist, FindingsEndWhenNobodyTakesMore)
{
    const kq_logic::Netlist netlist = ReadNetlist(Blif("1- 1"));
    std::vector<std::string> codes;
    EXPECT_EQ(netlist.Check([&codes](const kq_logic::NetlistFinding& finding) {
        codes.push_back(finding.code);
        EXPECT_EQ(finding.line, 4u);
        return true;
    }),
              2u);
    EXPECT_EQ(codes, (std::vector<std::string>{"idle-input", "wire"}));
    EXPECT_EQ(netlist.Check([](const kq_logic::NetlistFinding&) { return false; }), 1u);
}

TEST(KqLogicNetlist, OptionsOfAComparison)
{
    const kq_logic::Netlist left = ReadNetlist(Blif("10 1"));
    const kq_logic::Netlist right =
        ReadNetlist(".model m\n.inputs a b\n.outputs y w\n.names a b y\n10 1\n.names a w\n1 1\n"
                    ".cname w\n.end\n");
    kq_logic::CompareOptions options;
    const kq_logic::NetlistComparison strict = Compare(left, right, options);
    EXPECT_FALSE(strict.isSame);
    ASSERT_EQ(strict.added.size(), 1u);
    EXPECT_EQ(strict.added[0].path, "w");
    EXPECT_EQ(strict.added[0].wire, "only passes a");
    options.allowsWires = true;
    EXPECT_TRUE(Compare(left, right, options).isSame);
    options.maxDescribed = 0;
    const kq_logic::NetlistComparison counted = Compare(left, ReadNetlist(Blif("11 1")), options);
    EXPECT_EQ(counted.numDifferent, 1u);
    EXPECT_TRUE(counted.differences.empty());
}

} // namespace
