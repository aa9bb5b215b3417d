// Random texts of up to some hundred tokens, library against the reference model: acceptance,
// messages, tree, renderings, variables, results, and node evaluation over 32-bit tables.
// A failure prints the seed and a shortened text that still fails.
#include <gtest/gtest.h>

#include <functional>
#include <iostream>

#include "reference/evaluation.h"
#include "support/equation_compare.h"
#include "support/random_text.h"

namespace {

typedef std::vector<std::string> Texts;
typedef std::function<std::string(support::RandomText&)> Generator;

const Texts kFewNames = {"a", "b", "c", "'d e'"};
const Texts kTenNames = {"a", "B", "c_1", "_", "''", "'0x8'", "'&'", "AND", "x", "'.OR.'"};

// Node evaluation for tables whose entries are any 32 bits, shorter tables included.
std::string CompareNodeEval(unsigned int seed, const reference::Equation& model,
                            const Kq_BoolEquationImp& library)
{
    support::RandomText random(seed);
    for (int round = 0; round < 4; ++round) {
        std::vector<unsigned int> values;
        std::vector<std::pair<Port::StringBase<char>, unsigned int>> table;
        const size_t numEntries = model.GetNumVariables() + (round == 3 ? 0 : 1);
        while (values.size() + 1 < numEntries) {
            values.push_back(
                static_cast<unsigned int>(random.Below(round == 0 ? 4 : size_t(1) << 32)));
            table.push_back({"unused", values.back()});
        }
        const reference::Store& store = model.GetStore();
        if (reference::EvalTree(store.nodes, store.root, values) != library.GetRoot()->Eval(table))
            return "node evaluation differs in round " + std::to_string(round);
    }
    return "";
}

// Whether a tree read back from its own rendering is the same on both sides too.
std::string CompareReadBack(const reference::Equation& model, const Kq_BoolEquationImp& library)
{
    reference::Equation modelAgain;
    Kq_BoolEquationImp libraryAgain;
    support::Capture capture;
    const bool expected = modelAgain.SetEquation(model.GetEquation(true));
    if (expected != libraryAgain.SetEquation(library.GetEquation(true)))
        return "the rendering is read back by one side only";
    if ((modelAgain == model) != (libraryAgain == library) ||
        (modelAgain != model) != (libraryAgain != library))
        return "the rendering is read back as the same tree by one side only";
    return support::CompareState(modelAgain, libraryAgain);
}

std::string CompareText(unsigned int seed, const std::string& text)
{
    reference::Equation model;
    Kq_BoolEquationImp library;
    support::Capture capture;
    std::string difference = support::CompareSet(text, model, library, capture);
    if (!difference.empty() || !model)
        return difference;
    difference = CompareNodeEval(seed, model, library);
    return difference.empty() ? CompareReadBack(model, library) : difference;
}

// Removes pieces of the text, long ones first, while it still fails.
std::string Shrink(unsigned int seed, std::string text)
{
    for (size_t length = text.size() / 2; length > 0; length /= 2) {
        for (size_t position = 0; position + length <= text.size();) {
            std::string shorter = text;
            shorter.erase(position, length);
            if (CompareText(seed, shorter).empty())
                position += length;
            else
                text = shorter;
        }
    }
    return text;
}

// The number of accepted texts among 'numTexts'.
size_t CheckTexts(unsigned int firstSeed, unsigned int numTexts, const Generator& generate)
{
    size_t numAccepted = 0;
    for (unsigned int seed = firstSeed; seed < firstSeed + numTexts; ++seed) {
        support::RandomText random(seed);
        const std::string text = generate(random);
        if (!CompareText(seed, text).empty()) {
            const std::string shrunk = Shrink(seed, text);
            ADD_FAILURE() << "seed " << seed << ", text \"" << support::Printable(shrunk)
                          << "\": " << CompareText(seed, shrunk);
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
            EXPECT_EQ(CompareText(1, text), "") << numNodes << " " << unit;
            EXPECT_EQ(CompareText(1, text + "a"), "") << numNodes << " " << unit;
        }
    }
}

} // namespace
