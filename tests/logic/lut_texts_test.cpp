// Texts for many tables: each is the text for its function alone.
#include <random>

#include <gtest/gtest.h>

#include "kind.h"
#include "logic_support.h"
#include "lut_texts.h"

namespace {

using namespace booleq;
using namespace logic_support;

TEST(LutTexts, AreThoseOfEachFunctionAndReadBack)
{
    std::mt19937_64 random(5);
    for (unsigned int numInputs = 1; numInputs <= 6; ++numInputs) {
        const std::vector<std::string> names = Names(numInputs);
        std::vector<uint64_t> words;
        for (int count = 0; count < 60; ++count)
            words.push_back(count % 3 == 2 ? words[static_cast<size_t>(random() % words.size())]
                                           : random() & RowMask(numInputs));
        std::vector<uint64_t> places(words.size());
        const LutTexts found =
            DescribeLuts(LutsOf(words, numInputs), names, places.data(), LutWork{2});
        for (size_t place = 0; place < words.size(); ++place) {
            const LutText& text = found.texts[static_cast<size_t>(places[place])];
            const Function function(names, Rows::OfWord(numInputs, words[place]));
            const FunctionKind kind = FindKind(function);
            ASSERT_EQ(text.kind, kind.kind);
            ASSERT_EQ(text.name, kind.text);
            const Expression read = Parsed(text.shortForm);
            ASSERT_EQ(ToFunction(read).Over(names), function) << text.shortForm;
        }
    }
}

TEST(LutTexts, OfKnownFunctions)
{
    const LutTexts found = DescribeLuts(LutsOf({0x80, 0xca, 0xca}, 3), {"S", "A", "B"});
    ASSERT_EQ(found.texts.size(), 2u);
    EXPECT_EQ(found.distinct.counts, (std::vector<uint64_t>{1, 2}));
    EXPECT_EQ(found.texts[0].kind, "AND");
    EXPECT_EQ(found.texts[0].shortForm, "S & A & B");
    EXPECT_TRUE(found.texts[0].isMinimal);
    EXPECT_EQ(found.texts[1].name, "multiplexer, select S: A for S=1; B for S=0");
}

} // namespace
