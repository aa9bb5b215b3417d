// What is searched for: short expressions, names of functions, matches. Small sizes are tried
// whole.
#include <map>
#include <random>

#include <gtest/gtest.h>

#include "bits.h"
#include "cover.h"
#include "kind.h"
#include "logic_support.h"
#include "match.h"
#include "notation_writer.h"
#include "short_form.h"

namespace {

using namespace booleq;
using namespace logic_support;

const std::vector<std::string> kNames = {"A", "B", "C", "D", "E", "F", "G", "H", "I", "J"};

std::vector<std::string> FirstNames(size_t numInputs)
{
    return {kNames.begin(), kNames.begin() + long(numInputs)};
}

Function Make(size_t numInputs, uint64_t column)
{
    return Function(FirstNames(numInputs), {column});
}

std::string Shortest(const std::string& init, const std::vector<std::string>& inputs)
{
    Function function;
    FunctionFromInit(init, inputs, false, function);
    const ShortForm shortForm = FindShortForm(function);
    EXPECT_TRUE(shortForm.isFound);
    EXPECT_TRUE(ToFunction(shortForm.expression) == function);
    return WriteOwn(shortForm.expression, OwnSyntax::First, Parentheses::Clear);
}

size_t CountInputs(const Expression& expression)
{
    size_t count = 0;
    for (const Expression::Node& node : expression.nodes)
        count += node.op == Operator::Input ? 1 : 0;
    return count;
}

// The fewest operands of every function of three inputs, by going through all trees of operators by
// their number of operands, inversions tried everywhere.
std::map<unsigned int, size_t> FewestOperands()
{
    std::map<unsigned int, size_t> fewest;
    std::vector<std::vector<unsigned int>> bySize(2);
    const auto add = [&](unsigned int column, size_t size) {
        for (const unsigned int one : {column & 0xffu, ~column & 0xffu})
            if (fewest.emplace(one, size).second)
                bySize[size].push_back(one);
    };
    for (const unsigned int column : {0xf0u, 0xccu, 0xaau})
        add(column, 1);
    for (size_t size = 2; size <= 8; ++size) {
        bySize.emplace_back();
        for (size_t left = 1; left < size; ++left)
            for (const unsigned int one : bySize[left])
                for (const unsigned int other : bySize[size - left]) {
                    add(one & other, size);
                    add(one ^ other, size);
                }
    }
    return fewest;
}

TEST(FindShortForm, IsShortestForEveryFunctionOfThreeInputs)
{
    const std::map<unsigned int, size_t> fewest = FewestOperands();
    EXPECT_EQ(fewest.size(), 256u); // constants too, as A & ~A
    for (unsigned int column = 0; column < 256; ++column) {
        const Function function = Make(3, column);
        const ShortForm shortForm = FindShortForm(function);
        ASSERT_TRUE(shortForm.isFound);
        EXPECT_TRUE(shortForm.isMinimal);
        EXPECT_TRUE(ToFunction(shortForm.expression) == function) << function.Hex();
        EXPECT_EQ(CountInputs(shortForm.expression), shortForm.numLiterals);
        const bool isConstant = column == 0 || column == 255;
        EXPECT_EQ(shortForm.numLiterals, isConstant ? 0 : fewest.at(column)) << function.Hex();
    }
}

TEST(FindShortForm, FindsEveryFunctionOfFourInputs)
{
    for (unsigned int column = 0; column < 65536; column += 7) {
        const Function function = Make(4, column);
        const ShortForm shortForm = FindShortForm(function);
        ASSERT_TRUE(shortForm.isFound && shortForm.isMinimal);
        ASSERT_TRUE(ToFunction(shortForm.expression) == function) << function.Hex();
    }
}

TEST(FindShortForm, ProvesLargerFunctions)
{
    std::mt19937_64 random(1);
    for (size_t numInputs = 5; numInputs <= 9; ++numInputs)
        for (int count = 0; count < 20; ++count) {
            const Function function = RandomFunction(FirstNames(numInputs), random, true);
            const ShortForm shortForm = FindShortForm(function);
            ASSERT_TRUE(shortForm.isFound);
            ASSERT_TRUE(ToFunction(shortForm.expression) == function) << function.Hex();
            EXPECT_EQ(CountInputs(shortForm.expression), shortForm.numLiterals);
        }
}

TEST(FindShortForm, FindsPartsWithoutACommonInput)
{
    Kq_BoolEquation equation;
    ASSERT_TRUE(equation.SetEquation("((A & B) | (C ^ D)) & (E | (F & G))"));
    Function function;
    ASSERT_TRUE(FunctionOf(equation, function));
    const ShortForm shortForm = FindShortForm(function);
    EXPECT_TRUE(shortForm.isMinimal);
    EXPECT_EQ(shortForm.numLiterals, 7u);
}

TEST(FindShortForm, WritesWhatPeopleRead)
{
    EXPECT_EQ(Shortest("0xca", {"S", "A", "B"}), "(S & A) | (~S & B)");
    EXPECT_EQ(Shortest("0xe8", {"A", "B", "C"}), "(A & B) | ((A | B) & C)");
    EXPECT_EQ(Shortest("0x96", {"A", "B", "C"}), "A ^ B ^ C");
    EXPECT_EQ(Shortest("0x7f", {"A", "B", "C"}), "~(A & B & C)");
    EXPECT_EQ(Shortest("0x7", {"A", "B"}), "A ~& B");
    EXPECT_EQ(Shortest("0x00", {"A", "B", "C"}), "0");
}

TEST(Cover, IsExactAndHasNoProductToSpare)
{
    std::mt19937_64 random(2);
    for (size_t numInputs = 1; numInputs <= 8; ++numInputs)
        for (int count = 0; count < 20; ++count) {
            const Bits function(RandomFunction(FirstNames(numInputs), random, true));
            const std::vector<Cube> cubes = FindCover(function);
            const auto covers = [&](const Cube& cube, uint64_t row) {
                for (size_t input = 0; input < numInputs; ++input)
                    if ((cube.used >> input & 1u) != 0 &&
                        (cube.values >> input & 1u) != (row >> (numInputs - 1 - input) & 1u))
                        return false;
                return true;
            };
            std::vector<size_t> numAlone(cubes.size());
            for (uint64_t row = 0; row < function.NumRows(); ++row) {
                std::vector<size_t> which;
                for (size_t cube = 0; cube < cubes.size(); ++cube)
                    if (covers(cubes[cube], row))
                        which.push_back(cube);
                ASSERT_EQ(!which.empty(), function.At(row));
                if (which.size() == 1)
                    ++numAlone[which[0]];
            }
            for (const size_t alone : numAlone)
                EXPECT_GT(alone, 0u);
        }
}

std::string Said(const std::string& init, const std::vector<std::string>& inputs)
{
    Function function;
    FunctionFromInit(init, inputs, false, function);
    return FindKind(function).text;
}

TEST(FindKind, NamesFunctions)
{
    const std::vector<std::string> three = {"A", "B", "C"};
    EXPECT_EQ(Said("0x00", three), "constant 0");
    EXPECT_EQ(Said("0xff", three), "constant 1");
    EXPECT_EQ(Said("0xcc", three), "buffer of B");
    EXPECT_EQ(Said("0x33", three), "inverter of B");
    EXPECT_EQ(Said("0x80", three), "AND of A, B, C");
    EXPECT_EQ(Said("0x20", three), "AND of A, ~B, C");
    EXPECT_EQ(Said("0x01", three), "NOR of A, B, C");
    EXPECT_EQ(Said("0xfe", three), "OR of A, B, C");
    EXPECT_EQ(Said("0xfb", three), "OR of A, ~B, C");
    EXPECT_EQ(Said("0x7f", three), "NAND of A, B, C");
    EXPECT_EQ(Said("0x3c", three), "XOR of A, B: 1 when an odd number is 1");
    EXPECT_EQ(Said("0x69", three), "XNOR of A, B, C: 1 when an even number is 1");
    EXPECT_EQ(Said("0xe8", three), "majority of A, B, C");
    EXPECT_EQ(Said("0x8e", three), "majority of ~A, B, C");
    EXPECT_EQ(Said("0xca", three), "multiplexer, select A: B for A=1; C for A=0");
    EXPECT_EQ(Said("0xc5", three), "multiplexer, select A: B for A=1; ~C for A=0");
    EXPECT_EQ(Said("0x07", three), "and-or-invert (AOI21): ~((B & C) | A)");
    EXPECT_EQ(Said("0xf8", three), "and-or (AO21): (B & C) | A");
    EXPECT_EQ(Said("0xe0", three), "or-and (OA21): (B | C) & A");
    EXPECT_EQ(Said("0x1f", three), "or-and-invert (OAI21): ~((B | C) & A)");
    EXPECT_EQ(Said("0x16", three), "1 when the number of ones among A, B, C is 1");
    EXPECT_EQ(Said("0xfee8", {"A", "B", "C", "D"}), "at least 2 of A, B, C, D are 1");
    EXPECT_EQ(Said("0x0777", {"A", "B", "C", "D"}), "and-or-invert (AOI22): ~((A & B) | (C & D))");
    EXPECT_EQ(Said("0x9a", three), "");
}

TEST(FindKind, TellsIdleInputs)
{
    Function function;
    FunctionFromInit("0x3c", kNames.empty() ? kNames : std::vector<std::string>{"A", "B", "C"},
                     false, function);
    EXPECT_EQ(FindKind(function).idle, std::vector<std::string>{"C"});
    EXPECT_EQ(FindKind(function).mattering, (std::vector<std::string>{"A", "B"}));
}

TEST(FindKind, KnowsAMultiplexerOfFour)
{
    Kq_BoolEquation equation;
    ASSERT_TRUE(equation.SetEquation("(S&T&A)|(S&~T&B)|(~S&T&C)|(~S&~T&D)"));
    Function function;
    ASSERT_TRUE(FunctionOf(equation, function));
    EXPECT_EQ(FindKind(function).kind, "multiplexer");
}

// By trying every order and every inversion.
bool MatchesSomehow(const Function& first, const Function& second, bool allowInversions)
{
    std::vector<unsigned int> order(first.NumInputs());
    for (unsigned int input = 0; input < order.size(); ++input)
        order[input] = input;
    do {
        const uint32_t numInversions = allowInversions ? 1u << (order.size() + 1) : 1;
        for (uint32_t inversions = 0; inversions < numInversions; ++inversions) {
            Matching matching = {true, order, {}, (inversions >> order.size() & 1u) != 0};
            for (size_t input = 0; input < order.size(); ++input)
                matching.inverted.push_back((inversions >> input & 1u) != 0);
            if (Apply(matching, first, second.Inputs()) == second)
                return true;
        }
    } while (std::next_permutation(order.begin(), order.end()));
    return false;
}

TEST(Match, FindsAMappingWheneverThereIsOne)
{
    std::mt19937_64 random(3);
    size_t numMatches = 0;
    for (int count = 0; count < 3000; ++count) {
        const Function first = Make(3, random() & 0xff);
        const Function second = Make(3, random() & 0xff);
        for (const bool allowInversions : {false, true}) {
            const Matching matching = Match(first, second, allowInversions);
            ASSERT_EQ(matching.isFound, MatchesSomehow(first, second, allowInversions))
                << first.Hex() << " " << second.Hex();
            if (!matching.isFound)
                continue;
            ++numMatches;
            ASSERT_TRUE(Apply(matching, first, second.Inputs()) == second);
        }
    }
    EXPECT_GT(numMatches, 300u);
}

TEST(Match, FindsShuffledFunctionsOfTenInputs)
{
    std::mt19937_64 random(4);
    for (int count = 0; count < 5; ++count) {
        const Function first = RandomFunction(FirstNames(10), random, true);
        Matching shuffle = {true, {}, {}, count % 2 == 1};
        for (unsigned int input = 0; input < 10; ++input) {
            shuffle.sources.push_back((input * 3 + 1) % 10);
            shuffle.inverted.push_back((random() & 1u) != 0);
        }
        const Function second = Apply(shuffle, first, first.Inputs());
        const Matching matching = Match(first, second, true);
        ASSERT_TRUE(matching.isFound);
        EXPECT_TRUE(Apply(matching, first, second.Inputs()) == second);
    }
}

TEST(Match, IsQuickForInputsThatAreAlike)
{
    // A majority against itself with one row changed: every order fails for the same reason.
    std::vector<uint64_t> words(size_t(1) << 6);
    for (uint64_t row = 0; row < 4096; ++row)
        if (__builtin_popcountll(row) > 6)
            words[row / 64] |= uint64_t(1) << (row % 64);
    std::vector<std::string> names;
    for (int input = 0; input < 12; ++input)
        names.push_back("v" + std::to_string(input));
    const Function first(names, words);
    words[0] ^= 1;
    words[63] ^= uint64_t(1) << 63;
    const Function second(names, words);
    EXPECT_TRUE(Match(first, first, true).isFound);
    EXPECT_FALSE(Match(first, second, true).isFound);
}

} // namespace
