// Arrays of look-up tables: every kernel, for every word, against the same operation row by row.
#include <algorithm>
#include <bitset>
#include <cstring>
#include <map>
#include <numeric>
#include <random>

#include <gtest/gtest.h>

#include "distinct_luts.h"
#include "lut_kernels.h"

namespace {

using namespace booleq;

// The model: a table is its rows as a vector; an array is a vector of tables.
typedef std::vector<bool> Values;

// An array of tables that owns its memory.
struct OwnedLuts {
    OwnedLuts(unsigned int numInputs, unsigned int tableBytes, size_t count)
        : words((tableBytes * count + 7) / 8), luts{words.data(), count, numInputs, tableBytes}
    {
    }
    OwnedLuts(const OwnedLuts&) = delete;
    OwnedLuts& operator=(const OwnedLuts&) = delete;

    void* Memory() { return words.data(); }
    unsigned char* Bytes(size_t place)
    {
        return reinterpret_cast<unsigned char*>(words.data()) + place * luts.tableBytes;
    }
    // The byte that holds a row: a table is a word in this machine's order, or two of 64 bits.
    unsigned char& ByteOf(size_t place, unsigned int row)
    {
        const unsigned int wordBytes = std::min(luts.tableBytes, 8u);
        unsigned int byte = row / 8 % wordBytes;
#if __BYTE_ORDER__ == __ORDER_BIG_ENDIAN__
        byte = wordBytes - 1 - byte;
#endif
        return Bytes(place)[row / 64 * 8 + byte];
    }
    bool At(size_t place, unsigned int row)
    {
        return (ByteOf(place, row) >> (row % 8) & 1u) != 0;
    }
    Values ValuesAt(size_t place)
    {
        Values values;
        for (unsigned int row = 0; row < 8 * luts.tableBytes; ++row)
            values.push_back(At(place, row));
        EXPECT_EQ(std::count(values.begin() + (1u << luts.numInputs), values.end(), true), 0);
        values.resize(size_t(1) << luts.numInputs);
        return values;
    }

    std::vector<uint64_t> words;
    LutArray luts;
};

void Fill(OwnedLuts& owned, std::mt19937_64& random)
{
    const unsigned int numRows = 1u << owned.luts.numInputs;
    for (size_t place = 0; place < owned.luts.count; ++place) {
        const bool isIdle = random() % 4 == 0; // the last input has no effect
        for (unsigned int row = 0; row < numRows; ++row) {
            bool value = random() % 2 != 0;
            if (isIdle && row % 2 != 0)
                value = owned.At(place, row - 1);
            unsigned char& byte = owned.ByteOf(place, row);
            byte = static_cast<unsigned char>(byte | (value ? 1u << (row % 8) : 0u));
        }
    }
}

constexpr size_t kCount = 700; // more than a block

// Calls 'check' with random tables of every width and word, once by one thread, once by three.
template <class Check>
void ForRandomLuts(const Check& check)
{
    std::mt19937_64 random(3);
    for (unsigned int numInputs = 0; numInputs <= kMaxLutInputs; ++numInputs) {
        for (unsigned int tableBytes = 1; tableBytes <= 16; tableBytes *= 2) {
            if (!HasLutShape(numInputs, tableBytes))
                continue;
            for (const unsigned int numThreads : {1u, 3u}) {
                OwnedLuts owned(numInputs, tableBytes, kCount);
                Fill(owned, random);
                check(owned, LutWork{numThreads}, random);
            }
        }
    }
}

bool InputAt(unsigned int row, unsigned int input, unsigned int numInputs)
{
    return (row >> (numInputs - 1 - input) & 1u) != 0;
}

unsigned int WithInput(unsigned int row, unsigned int input, bool value, unsigned int numInputs)
{
    const unsigned int bit = 1u << (numInputs - 1 - input);
    return value ? row | bit : row & ~bit;
}

Values Permuted(const Values& values, const uint8_t* order, unsigned int numInputs)
{
    Values result;
    for (unsigned int row = 0; row < values.size(); ++row) {
        unsigned int source = 0;
        for (unsigned int input = 0; input < numInputs; ++input)
            source = WithInput(source, order[input], InputAt(row, input, numInputs), numInputs);
        result.push_back(values[source]);
    }
    return result;
}

std::vector<uint8_t> RandomOrder(unsigned int numInputs, std::mt19937_64& random)
{
    std::vector<uint8_t> order(numInputs);
    std::iota(order.begin(), order.end(), uint8_t(0));
    std::shuffle(order.begin(), order.end(), random);
    return order;
}

TEST(Luts, ShapesThatGoTogether)
{
    EXPECT_TRUE(HasLutShape(0, 1));
    EXPECT_TRUE(HasLutShape(3, 1));
    EXPECT_FALSE(HasLutShape(4, 1));
    EXPECT_TRUE(HasLutShape(4, 8));
    EXPECT_FALSE(HasLutShape(5, 3));
    EXPECT_FALSE(HasLutShape(6, 16));
    EXPECT_FALSE(HasLutShape(7, 8));
    EXPECT_TRUE(HasLutShape(7, 16));
    EXPECT_FALSE(HasLutShape(8, 16));
    EXPECT_FALSE(HasLutShape(2, 0));
}

TEST(Luts, AreEvaluated)
{
    ForRandomLuts([](OwnedLuts& owned, const LutWork& work, std::mt19937_64& random) {
        const auto numRows = 1u << owned.luts.numInputs;
        const auto row = static_cast<uint8_t>(random() % numRows);
        std::vector<uint8_t> rows(kCount);
        for (uint8_t& each : rows)
            each = static_cast<uint8_t>(random() % numRows);
        std::vector<uint8_t> inOne(kCount);
        std::vector<uint8_t> inEach(kCount);
        EvaluateLuts(owned.luts, row, inOne.data(), work);
        EvaluateLutsEach(owned.luts, rows.data(), inEach.data(), work);
        for (size_t place = 0; place < kCount; ++place) {
            ASSERT_EQ(inOne[place], owned.At(place, row) ? 1 : 0);
            ASSERT_EQ(inEach[place], owned.At(place, rows[place]) ? 1 : 0);
        }
    });
}

TEST(Luts, ArePermutedByOneOrderOrOneEach)
{
    ForRandomLuts([](OwnedLuts& owned, const LutWork& work, std::mt19937_64& random) {
        const unsigned int numInputs = owned.luts.numInputs;
        const std::vector<uint8_t> order = RandomOrder(numInputs, random);
        std::vector<uint8_t> orders;
        for (size_t place = 0; place < kCount; ++place)
            for (const uint8_t input : RandomOrder(numInputs, random))
                orders.push_back(input);
        ASSERT_EQ(FirstBadOrder(orders.data(), kCount, numInputs, work), kNoLut);
        OwnedLuts byOne(numInputs, owned.luts.tableBytes, kCount);
        OwnedLuts byEach(numInputs, owned.luts.tableBytes, kCount);
        PermuteLuts(owned.luts, order.data(), byOne.Memory(), work);
        PermuteLutsEach(owned.luts, orders.data(), byEach.Memory(), work);
        for (size_t place = 0; place < kCount; ++place) {
            const Values values = owned.ValuesAt(place);
            ASSERT_EQ(byOne.ValuesAt(place), Permuted(values, order.data(), numInputs));
            ASSERT_EQ(byEach.ValuesAt(place),
                      Permuted(values, orders.data() + place * numInputs, numInputs));
        }
        PermuteLuts(owned.luts, order.data(), owned.Memory(), work); // in place
        ASSERT_EQ(owned.words, byOne.words);
    });
}

TEST(Luts, BadOrdersAreFound)
{
    const uint8_t orders[] = {0, 1, 2, 2, 1, 0, 1, 1, 0, 0, 1, 3};
    EXPECT_EQ(FirstBadOrder(orders, 2, 3), kNoLut);
    EXPECT_EQ(FirstBadOrder(orders, 4, 3), 2u);
    EXPECT_EQ(FirstBadOrder(orders + 9, 1, 3), 0u);
}

TEST(Luts, AreInverted)
{
    ForRandomLuts([](OwnedLuts& owned, const LutWork& work, std::mt19937_64&) {
        const unsigned int numInputs = owned.luts.numInputs;
        const unsigned int tableBytes = owned.luts.tableBytes;
        OwnedLuts inverse(numInputs, tableBytes, kCount);
        InvertLuts(owned.luts, inverse.Memory(), work);
        for (size_t place = 0; place < kCount; ++place) {
            Values expected = owned.ValuesAt(place);
            expected.flip();
            ASSERT_EQ(inverse.ValuesAt(place), expected);
        }
    });
}

TEST(Luts, CofactorsLoseTheirInput)
{
    ForRandomLuts([](OwnedLuts& owned, const LutWork& work, std::mt19937_64& random) {
        const unsigned int numInputs = owned.luts.numInputs;
        for (unsigned int input = 0; input < numInputs; ++input) {
            const bool value = random() % 2 != 0;
            unsigned int lessBytes = LutBytes(numInputs - 1);
            if (lessBytes < 8 && random() % 2 != 0)
                lessBytes *= 2;
            OwnedLuts less(numInputs - 1, lessBytes, kCount);
            FixLutInput(owned.luts, input, value, less.Memory(), lessBytes, work);
            for (size_t place = 0; place < kCount; ++place) {
                const Values values = owned.ValuesAt(place);
                Values shorter;
                for (unsigned int row = 0; row < values.size(); ++row)
                    if (InputAt(row, input, numInputs) == value)
                        shorter.push_back(values[row]);
                ASSERT_EQ(less.ValuesAt(place), shorter);
            }
        }
    });
}

TEST(Luts, SupportAndOnesAreThoseOfTheirRows)
{
    ForRandomLuts([](OwnedLuts& owned, const LutWork& work, std::mt19937_64&) {
        const unsigned int numInputs = owned.luts.numInputs;
        std::vector<uint8_t> supports(kCount);
        std::vector<uint8_t> counts(kCount);
        FindLutSupports(owned.luts, supports.data(), work);
        CountLutOnes(owned.luts, counts.data(), work);
        for (size_t place = 0; place < kCount; ++place) {
            const Values values = owned.ValuesAt(place);
            unsigned int support = 0;
            for (unsigned int row = 0; row < values.size(); ++row)
                for (unsigned int input = 0; input < numInputs; ++input)
                    if (values[row] != values[WithInput(row, input, true, numInputs)])
                        support |= 1u << input;
            ASSERT_EQ(supports[place], support);
            ASSERT_EQ(counts[place], std::count(values.begin(), values.end(), true));
        }
    });
}

TEST(Luts, DistinctOnesAreSortedAndCounted)
{
    ForRandomLuts([](OwnedLuts& owned, const LutWork&, std::mt19937_64& random) {
        const unsigned int tableBytes = owned.luts.tableBytes;
        for (size_t place = 1; place < kCount; ++place)
            if (random() % 2 != 0)
                std::memcpy(owned.Bytes(place), owned.Bytes(static_cast<size_t>(random() % place)),
                            tableBytes);
        std::map<Values, std::vector<size_t>> expected; // by rows, the last the most significant
        for (size_t place = 0; place < kCount; ++place) {
            Values values = owned.ValuesAt(place);
            std::reverse(values.begin(), values.end());
            expected[values].push_back(place);
        }
        std::vector<uint64_t> places(kCount);
        const DistinctLuts found = FindDistinctLuts(owned.luts, places.data());
        ASSERT_EQ(found.counts.size(), expected.size());
        const LutArray words = LutsOf(found.words, owned.luts.numInputs);
        ASSERT_EQ(words.count, expected.size());
        size_t distinct = 0;
        for (const auto& entry : expected) {
            ASSERT_EQ(found.firstPlaces[distinct], entry.second.front());
            ASSERT_EQ(found.counts[distinct], entry.second.size());
            for (const size_t place : entry.second)
                ASSERT_EQ(places[place], distinct);
            for (size_t row = 0; row < entry.first.size(); ++row) {
                const size_t word = distinct * (words.tableBytes / 8) + row / 64;
                ASSERT_EQ((found.words[word] >> (row % 64) & 1u) != 0,
                          entry.first[entry.first.size() - 1 - row]);
            }
            ++distinct;
        }
    });
}

// Arrays of several parts, shared by threads: each result is in its own place.
TEST(Luts, ManyAreDoneByThreadsAsByOne)
{
    constexpr unsigned int kNumInputs = 6;
    constexpr uint8_t kOrder[kNumInputs] = {5, 0, 4, 1, 3, 2};
    std::mt19937_64 random(4);
    std::vector<uint64_t> words(300001);
    std::generate(words.begin(), words.end(), random);
    const LutArray luts = LutsOf(words, kNumInputs);
    for (const unsigned int numThreads : {1u, 4u}) {
        const LutWork work = {numThreads};
        std::vector<uint64_t> permuted(words.size());
        std::vector<uint8_t> counts(words.size());
        PermuteLuts(luts, kOrder, permuted.data(), work);
        CountLutOnes(luts, counts.data(), work);
        for (size_t place = 0; place < words.size(); ++place) {
            const uint64_t word = words[place];
            ASSERT_EQ(counts[place], std::bitset<64>(word).count());
            ASSERT_EQ(std::bitset<64>(permuted[place]).count(), counts[place]);
            const auto row = static_cast<unsigned int>(place % 64);
            unsigned int source = 0;
            for (unsigned int input = 0; input < kNumInputs; ++input)
                source =
                    WithInput(source, kOrder[input], InputAt(row, input, kNumInputs), kNumInputs);
            ASSERT_EQ(permuted[place] >> row & 1u, word >> source & 1u);
        }
    }
}

} // namespace
