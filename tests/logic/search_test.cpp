// Searches for short expressions, names of functions and matches. Small sizes are tested
// completely.
#include <map>
#include <random>

#include <gtest/gtest.h>

#include "cover.h"
#include "kind.h"
#include "logic_support.h"
#include "match.h"
#include "notation_writer.h"
#include "short_form.h"
#include "spectrum.h"

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
    return {FirstNames(numInputs), Rows::OfWord(static_cast<unsigned int>(numInputs), column)};
}

std::string Shortest(const std::string& init, const std::vector<std::string>& inputs)
{
    const Function function = FromInit(init, inputs);
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

// The fewest operands for every function of three inputs: goes through all trees of operators by
// their number of operands, with inversions everywhere.
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
            const Rows function = RandomFunction(FirstNames(numInputs), random, true).GetRows();
            const std::vector<Cube> cubes = FindCover(function);
            ASSERT_EQ(CountCoverLiterals(function), CountLiterals(cubes));
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
    return FindKind(FromInit(init, inputs)).text;
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
    const Function function = FromInit("0x3c", {"A", "B", "C"});
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

// Tries every order and every inversion.
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
    // A majority function against itself with one row changed: every order fails for the same
    // reason.
    Rows rows(12);
    for (size_t row = 0; row < rows.NumRows(); ++row)
        rows.Set(row, __builtin_popcountll(row) > 6);
    std::vector<std::string> names;
    for (int input = 0; input < 12; ++input)
        names.push_back("v" + std::to_string(input));
    const Function first(names, rows);
    rows.Set(0, !rows.At(0));
    rows.Set(4095, !rows.At(4095));
    const Function second(names, rows);
    EXPECT_TRUE(Match(first, first, true).isFound);
    EXPECT_FALSE(Match(first, second, true).isFound);
}

TEST(Match, LeavesInputsWithoutEffectOut)
{
    const Function narrow = Make(3, 0xca);
    const Function wide = Make(4, 0xcaca);
    const Matching matching = Match(narrow, wide, false);
    ASSERT_TRUE(matching.isFound);
    EXPECT_EQ(matching.sources, (std::vector<unsigned int>{Matching::kIdle, 0, 1, 2}));
    EXPECT_TRUE(Apply(matching, narrow, wide.Inputs()) == wide);
    const Matching back = Match(wide, narrow, true);
    ASSERT_TRUE(back.isFound);
    EXPECT_TRUE(Apply(back, wide, narrow.Inputs()) == narrow);
    EXPECT_FALSE(Match(narrow, Make(4, 0xcacb), true).isFound);
}

TEST(Match, FindsAMappingOfFourInputsWheneverThereIsOne)
{
    std::mt19937_64 random(5);
    size_t numMatches = 0;
    for (int count = 0; count < 400; ++count) {
        // Few ones, so that many pairs match.
        const Function first = Make(4, random() & random() & random() & 0xffff);
        const Function second = Make(4, random() & random() & random() & 0xffff);
        const Matching matching = Match(first, second, true);
        ASSERT_EQ(matching.isFound, MatchesSomehow(first, second, true))
            << first.Hex() << " " << second.Hex();
        numMatches += matching.isFound ? 1 : 0;
    }
    EXPECT_GT(numMatches, 10u);
}

// Sixteen inputs that look alike one by one and in pairs: two strongly regular graphs with the same
// parameters; the function is an OR of the products of the edges.
Function OfGraph(bool isShrikhande)
{
    const auto isEdge = [isShrikhande](unsigned int one, unsigned int other) {
        const unsigned int row = (one / 4 + 4 - other / 4) % 4;
        const unsigned int column = (one + 4 - other % 4) % 4;
        if (isShrikhande)
            return row * 4 + column == 1 || row * 4 + column == 3 || row * 4 + column == 4 ||
                   row * 4 + column == 12 || row * 4 + column == 5 || row * 4 + column == 15;
        return (row == 0) != (column == 0);
    };
    Rows rows(16);
    for (size_t row = 0; row < rows.NumRows(); ++row)
        for (unsigned int one = 0; one < 16; ++one)
            for (unsigned int other = 0; other < one; ++other)
                if ((row >> one & row >> other & 1u) != 0 && isEdge(one, other))
                    rows.Set(row, true);
    return {Names(16), rows};
}

TEST(Match, TellsGraphsOfSixteenInputsApart)
{
    EXPECT_TRUE(Match(OfGraph(true), OfGraph(true), true).isFound);
    EXPECT_FALSE(Match(OfGraph(true), OfGraph(false), true).isFound);
}

TEST(Match, TellsLargeRandomFunctionsApart)
{
    std::mt19937_64 random(6);
    const Function first = RandomFunction(Names(16), random);
    Rows rows = first.GetRows();
    // As many ones, but two rows are exchanged.
    rows.Words()[0] ^= uint64_t(1) << __builtin_ctzll(rows.Words()[0]);
    rows.Words()[1] ^= uint64_t(1) << __builtin_ctzll(~rows.Words()[1]);
    EXPECT_FALSE(Match(first, Function(first.Inputs(), rows), true).isFound);
}

TEST(Match, EndsWithItsTime)
{
    std::mt19937_64 random(7);
    const Function function = RandomFunction(Names(16), random);
    const Matching matching = Match(function, function, true, 1e-9);
    EXPECT_FALSE(matching.isDecided);
    EXPECT_FALSE(matching.isFound);
}

TEST(Spectrum, IsTheSumOfItsDefinition)
{
    std::mt19937_64 random(8);
    for (unsigned int numInputs = 0; numInputs <= 8; ++numInputs) {
        const Function function = RandomFunction(FirstNames(numInputs), random);
        const std::vector<int32_t> spectrum = WalshSpectrum(function.GetRows());
        const std::vector<uint32_t> weights = DerivativeWeights(function.GetRows());
        for (uint64_t set = 0; set < function.NumRows(); ++set) {
            int32_t sum = 0;
            uint32_t weight = 0;
            for (uint64_t row = 0; row < function.NumRows(); ++row) {
                const bool parity = (__builtin_popcountll(row & set) & 1) != 0;
                sum += function.At(row) != parity ? -1 : 1;
                if (set == 0 || (row & set) != 0)
                    continue;
                bool difference = false; // over all rows that differ from this one only in 'set'
                for (uint64_t part = set;; part = (part - 1) & set) {
                    difference = difference != function.At(row | part);
                    if (part == 0)
                        break;
                }
                weight += difference ? 1 : 0;
            }
            ASSERT_EQ(spectrum[static_cast<size_t>(set)], sum) << numInputs << " " << set;
            ASSERT_EQ(weights[static_cast<size_t>(set)], weight) << numInputs << " " << set;
        }
    }
}

} // namespace
