// Random texts of up to some hundred tokens, library against the reference model: acceptance,
// messages, tree, renderings, variables, results, and evaluation of nodes over 32-bit tables. A
// failure prints the seed and a shortened text that still fails.
#include <gtest/gtest.h>

#include <functional>
#include <iostream>

#include "reference/equation.h"
#include "support/library_view.h"
#include "support/random_text.h"
#include "support/text_compare.h"

namespace {

typedef std::vector<std::string> Texts;
typedef std::function<std::string(support::RandomText&)> Generator;

const Texts kFewNames = {"a", "b", "c", "'d e'"};
const Texts kTenNames = {"a", "B", "c_1", "_", "''", "'0x8'", "'&'", "AND", "x", "'.OR.'"};

// The number of accepted texts among 'numTexts'.
size_t CheckTexts(unsigned int firstSeed, unsigned int numTexts, const Generator& generate)
{
    size_t numAccepted = 0;
    for (unsigned int seed = firstSeed; seed < firstSeed + numTexts; ++seed) {
        support::RandomText random(seed);
        const std::string text = generate(random);
        if (!support::CompareText(seed, text).empty()) {
            const std::string shrunk = support::ShrinkText(seed, text);
            ADD_FAILURE() << "seed " << seed << ", text \"" << support::Printable(shrunk)
                          << "\": " << support::CompareText(seed, shrunk);
            break;
        }
        reference::Equation model;
        numAccepted += model.SetEquation(text);
    }
    reference::Log().clear();
    std::cout << "accepted " << numAccepted << " of " << numTexts << "\n";
    return numAccepted;
}

TEST(Texts, WellFormedTextsOverFewNamesAgree)
{
    const size_t numAccepted = CheckTexts(1, 4000, [](support::RandomText& random) {
        return random.WellFormed(1 + random.Below(400), kFewNames, false);
    });
    EXPECT_EQ(numAccepted, 4000u);
}

TEST(Texts, TextsWithNegatedOperatorsAgree)
{
    const size_t numAccepted = CheckTexts(100001, 6000, [](support::RandomText& random) {
        return random.WellFormed(1 + random.Below(200), kFewNames, true);
    });
    EXPECT_EQ(numAccepted, 6000u);
}

TEST(Texts, TextsOverTenNamesAgree)
{
    const size_t numAccepted = CheckTexts(200001, 60, [](support::RandomText& random) {
        const size_t numTokens = 1 + random.Below(300);
        return random.WellFormed(numTokens, kTenNames, random.Chance(50));
    });
    EXPECT_EQ(numAccepted, 60u);
}

TEST(Texts, MutatedTextsAgree)
{
    const size_t numAccepted = CheckTexts(300001, 10000, [](support::RandomText& random) {
        const size_t numTokens = 1 + random.Below(60);
        return random.Mutated(random.WellFormed(numTokens, kFewNames, random.Chance(50)));
    });
    EXPECT_EQ(numAccepted, 1691u);
}

TEST(Texts, TokensInAnyOrderAgree)
{
    const size_t numAccepted = CheckTexts(400001, 20000, [](support::RandomText& random) {
        return random.TokenSoup(1 + random.Below(random.Chance(80) ? 10 : 60), kFewNames);
    });
    EXPECT_EQ(numAccepted, 1449u);
}

TEST(Texts, RandomBytesAgree)
{
    const size_t numAccepted = CheckTexts(
        500001, 50000, [](support::RandomText& random) { return random.Bytes(random.Below(12)); });
    EXPECT_EQ(numAccepted, 3427u);
}

// Failure dumps are cut at 256 node lines; these refused texts have about as many nodes.
TEST(Texts, LongFailureDumpsAgree)
{
    const size_t numAccepted = CheckTexts(600001, 300, [](support::RandomText& random) {
        const std::string text = random.WellFormed(random.Below(700), kFewNames, false);
        return random.Chance(50) ? "& " + text : text + " &";
    });
    EXPECT_EQ(numAccepted, 0u);
}

TEST(Texts, FailureDumpsOf250To262NodesAgree)
{
    for (size_t numNodes = 250; numNodes <= 262; ++numNodes) {
        for (const char* unit : {"~ ", "a ", "a&"}) {
            // The last operator has no second operand, or the first "a" has a child.
            std::string text = "& ";
            while (text.size() < 2 * numNodes)
                text += unit;
            EXPECT_EQ(support::CompareText(1, text), "") << numNodes << " " << unit;
            EXPECT_EQ(support::CompareText(1, text + "a"), "") << numNodes << " " << unit;
        }
    }
}

} // namespace
