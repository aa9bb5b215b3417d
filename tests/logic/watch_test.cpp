// Long work can be interrupted wherever it calls Watch(), and works the same again afterwards.
#include <functional>
#include <random>
#include <stdexcept>

#include <gtest/gtest.h>

#include "convert.h"
#include "kind.h"
#include "lint.h"
#include "logic_support.h"
#include "match.h"
#include "short_form.h"
#include "shortest.h"
#include "watch.h"

namespace {

using namespace booleq;
using namespace logic_support;

struct Interrupt : std::runtime_error {
    Interrupt() : std::runtime_error("interrupt") {}
};

size_t numCalls = 0;
size_t callToEndAt = 0;

void CountAndEnd()
{
    if (++numCalls == callToEndAt)
        throw Interrupt();
}

// 'work' must call Watch(), and give the same result after it was interrupted at each of several
// calls.
void ExpectItCanBeEnded(const std::function<std::string()>& work)
{
    const std::string expected = work();
    numCalls = 0;
    callToEndAt = SIZE_MAX;
    SetWatch(CountAndEnd);
    EXPECT_EQ(expected, work());
    const size_t allCalls = numCalls;
    EXPECT_GT(allCalls, 0u);
    for (const size_t call : {size_t(1), allCalls / 3 + 1, allCalls / 2 + 1, allCalls}) {
        numCalls = 0;
        callToEndAt = call;
        EXPECT_THROW(work(), Interrupt) << "call " << call << " of " << allCalls;
    }
    SetWatch(nullptr);
    EXPECT_EQ(expected, work());
}

// The table of the search grows with the first questions, so this needs its own process, as every
// test started by ctest has.
TEST(Watch, EndsTheSearchForTheShortestAndItsTableStaysWhole)
{
    const Rows hard = Rows::OfWord(4, 0x1668);
    size_t numEnded = 0;
    SetWatch(CountAndEnd);
    for (callToEndAt = 1; callToEndAt < 10000; callToEndAt += callToEndAt / 4 + 1) {
        numCalls = 0;
        try {
            FindShortest(hard);
        } catch (const Interrupt&) {
            ++numEnded;
        }
        if (numCalls == 0)
            break;
    }
    SetWatch(nullptr);
    if (numEnded == 0)
        GTEST_SKIP() << "the table is there already";
    EXPECT_GT(numEnded, 10u);
    // For all functions together, as without an interrupt.
    size_t numLiterals = 0;
    for (uint64_t column = 0; column < 65536; ++column)
        numLiterals += CountLiterals(FindShortest(Rows::OfWord(4, column)));
    EXPECT_EQ(406800u, numLiterals);
}

TEST(Watch, EndsColumns)
{
    std::string text = "v0";
    for (int number = 1; number < 22; ++number)
        text += " ^ v" + std::to_string(number);
    std::mt19937 random(1);
    for (int number = 0; number < 500; ++number)
        text +=
            " ^ (v" + std::to_string(random() % 22) + " & v" + std::to_string(random() % 22) + ")";
    Kq_BoolEquation equation(text.c_str());
    ExpectItCanBeEnded([&] {
        Function function;
        EXPECT_TRUE(FunctionOf(equation, function));
        return function.Hex();
    });
}

TEST(Watch, EndsMinimisingMatchingAndExplaining)
{
    std::mt19937_64 random(7);
    const Function function = RandomFunction(Names(9), random);
    ExpectItCanBeEnded([&] {
        const ShortForm shortForm = FindShortForm(function);
        return std::to_string(shortForm.numLiterals);
    });
    ExpectItCanBeEnded([&] { return FindKind(function).text; });
    const Function other = function.Over({"v3", "v1", "v8", "v0", "v2", "v4", "v7", "v5", "v6"});
    ExpectItCanBeEnded([&] {
        std::string text;
        for (const unsigned int source : Match(function, other, true).sources)
            text += std::to_string(source) + " ";
        return text;
    });
}

TEST(Watch, EndsComparisonsOfLintAndConvert)
{
    std::string text = "v0";
    for (int number = 1; number < 14; ++number)
        text += (number % 2 != 0 ? " | v" : " & v") + std::to_string(number);
    const Kq_BoolEquation equation(text.c_str());
    ExpectItCanBeEnded([&] {
        std::string found;
        for (const ForeignReading& reading : Lint(text, equation, Reading(), {}).readings)
            found += reading.grouping + reading.textHere;
        return found;
    });
    ExpectItCanBeEnded(
        [&] { return Convert(ToExpression(equation), *FindTarget("verilog"), "", {}).text; });
}

} // namespace
