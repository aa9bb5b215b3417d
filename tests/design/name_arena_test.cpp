// Names are kept once each and have numbers.
#include <string>
#include <vector>

#include <gtest/gtest.h>

#include "name_arena.h"

namespace {

using booleq::NameArena;
using booleq::NameId;

TEST(NameArena, ANameHasOneNumber)
{
    NameArena names;
    const NameId first = names.Add("a");
    const NameId second = names.Add("b");
    EXPECT_NE(first, second);
    EXPECT_EQ(names.Add("a"), first);
    EXPECT_EQ(names.Text(first), "a");
    EXPECT_EQ(names.Text(second), "b");
    EXPECT_EQ(names.Size(), 3u); // including the empty one
}

TEST(NameArena, TheEmptyNameIsZero)
{
    NameArena names;
    EXPECT_EQ(names.Add(""), 0u);
    EXPECT_EQ(names.Find(""), 0u);
    EXPECT_EQ(names.Text(0), "");
    EXPECT_EQ(names.Size(), 1u);
}

TEST(NameArena, AnUnknownNameIsNotFoundAndNotAdded)
{
    NameArena names;
    names.Add("there");
    for (const char* name : {"ther", "there1", "THERE", "here"})
        EXPECT_EQ(names.Find(name), NameArena::kNoName) << name;
    EXPECT_EQ(names.Find("there"), 1u);
    EXPECT_EQ(names.Size(), 2u);
}

// Names of all lengths around the eight bytes hashed at a time, and with zero bytes.
TEST(NameArena, NamesThatAreAlikeAreKeptApart)
{
    NameArena names;
    std::vector<std::string> all;
    for (size_t length = 1; length <= 33; ++length)
        for (const char last : {'a', 'b', '\0'})
            all.push_back(std::string(length - 1, '\0') + last);
    for (size_t place = 0; place < all.size(); ++place)
        EXPECT_EQ(names.Add(all[place]), place + 1);
    for (size_t place = 0; place < all.size(); ++place) {
        EXPECT_EQ(names.Find(all[place]), place + 1);
        EXPECT_EQ(names.Text(static_cast<NameId>(place + 1)), all[place]);
    }
}

TEST(NameArena, NamesKeepTheirNumbersWhenItGrows)
{
    constexpr size_t kNumNames = 100000;
    for (const uint64_t reserved : {uint64_t(0), uint64_t(1000), uint64_t(1) << 26}) {
        NameArena names;
        names.Reserve(reserved);
        const auto name = [](size_t place) { return "$abc$" + std::to_string(place); };
        for (size_t place = 0; place < kNumNames; ++place)
            ASSERT_EQ(names.Add(name(place)), place + 1);
        for (size_t place = 0; place < kNumNames; ++place) {
            ASSERT_EQ(names.Add(name(place)), place + 1);
            ASSERT_EQ(names.Text(static_cast<NameId>(place + 1)), name(place));
        }
        EXPECT_EQ(names.Size(), kNumNames + 1);
        EXPECT_GE(names.NumBytes(), kNumNames * 8);
    }
}

TEST(NameArena, ReservingLaterKeepsWhatIsThere)
{
    NameArena names;
    const NameId first = names.Add("first");
    names.Reserve(uint64_t(1) << 24);
    EXPECT_EQ(names.Find("first"), first);
    EXPECT_EQ(names.Text(first), "first");
}

} // namespace
