// Arrays of six-input look-up tables: one thread against a loop over the rows of each table, and
// two threads by the clock; canonical forms against every transformation, also for functions whose
// inputs are hard to tell apart; texts.
#include <algorithm>
#include <array>
#include <chrono>
#include <memory>
#include <numeric>
#include <random>

#include "canonical.h"
#include "lut_kernels.h"
#include "lut_texts.h"
#include "lut_word.h"
#include "rows.h"
#include "support/cases.h"

namespace {

using namespace booleq;

typedef std::vector<uint64_t> Tables;
typedef std::vector<uint8_t> Bytes;

constexpr unsigned int kNumInputs = 6;
constexpr size_t kNumRows = 64;
constexpr size_t kNumTables = 100000;     // by one thread
constexpr size_t kNumAllTables = 1000000; // by two
constexpr size_t kNumTried = 20;          // whose transformations are all tried
constexpr size_t kNumTexts = 1000;
constexpr uint8_t kOrder[kNumInputs] = {3, 5, 1, 0, 2, 4};
constexpr LutWork kOneThread = {1};
constexpr LutWork kTwoThreads = {2};

Tables RandomTables(size_t count)
{
    std::mt19937_64 random(1);
    Tables tables(count);
    std::generate(tables.begin(), tables.end(), random);
    return tables;
}

Bytes RandomOrders(size_t count)
{
    std::mt19937_64 random(2);
    Bytes orders;
    for (size_t place = 0; place < count; ++place) {
        std::array<uint8_t, kNumInputs> order = {0, 1, 2, 3, 4, 5};
        std::shuffle(order.begin(), order.end(), random);
        orders.insert(orders.end(), order.begin(), order.end());
    }
    return orders;
}

// The loops that a program would have without the library.
uint64_t PermutePlainly(uint64_t table, const uint8_t* order)
{
    uint64_t result = 0;
    for (unsigned int row = 0; row < kNumRows; ++row) {
        unsigned int source = 0;
        for (unsigned int input = 0; input < kNumInputs; ++input)
            source |= (row >> (kNumInputs - 1 - input) & 1u) << (kNumInputs - 1 - order[input]);
        result |= (table >> source & 1u) << row;
    }
    return result;
}

uint8_t SupportPlainly(uint64_t table)
{
    unsigned int inputs = 0;
    for (unsigned int input = 0; input < kNumInputs; ++input)
        for (unsigned int row = 0; row < kNumRows; ++row)
            if ((table >> row & 1u) != (table >> (row ^ 1u << (kNumInputs - 1 - input)) & 1u))
                inputs |= 1u << input;
    return static_cast<uint8_t>(inputs);
}

uint8_t CountPlainly(uint64_t table)
{
    unsigned int count = 0;
    for (unsigned int row = 0; row < kNumRows; ++row)
        count += table >> row & 1u;
    return static_cast<uint8_t>(count);
}

// Every order by exchanging two inputs and, for each, every inversion by inverting one more input
// (a Gray code).
uint64_t TryAll(uint64_t table)
{
    uint64_t least = UINT64_MAX;
    std::array<uint8_t, kNumInputs> order = {0, 1, 2, 3, 4, 5};
    do {
        LutTransformation how;
        std::copy(order.begin(), order.end(), how.order);
        uint64_t word = Transform(how, table, kNumInputs);
        for (unsigned int step = 1; step <= kNumRows; ++step) {
            least = std::min({least, word, ~word});
            word = InvertLutBit(
                word, std::min(static_cast<unsigned int>(__builtin_ctz(step)), kNumInputs - 1));
        }
    } while (std::next_permutation(order.begin(), order.end()));
    return least;
}

// 'work' fills results from tables in one or two threads, 'plain' from one table and its position.
template <class Result>
struct Operation {
    std::function<void(const LutArray&, Result*, const LutWork&)> work;
    std::function<Result(uint64_t, size_t)> plain;
};

template <class Result>
bool IsAsPlain(const Operation<Result>& operation, const Tables& tables,
               const std::vector<Result>& results, size_t numPlain)
{
    for (size_t place = 0; place < numPlain; ++place)
        if (results[place] != operation.plain(tables[place], place))
            return false;
    return true;
}

// The plain loop and the check of the answer cover only the first 'numPlain' tables.
template <class Result>
void AddOperation(const std::string& name, const Operation<Result>& operation, size_t numPlain)
{
    constexpr size_t count = kNumTables;
    const auto tables = std::make_shared<Tables>();
    bench::AddPair(name, [=] {
        bench::Case made;
        made.isRight = [=] {
            *tables = RandomTables(count);
            std::vector<Result> results(count);
            operation.work(LutsOf(*tables, kNumInputs), results.data(), kOneThread);
            return IsAsPlain(operation, *tables, results, numPlain);
        };
        made.ours = [=](benchmark::State& state) {
            std::vector<Result> results(count);
            for (auto _ : state) {
                operation.work(LutsOf(*tables, kNumInputs), results.data(), kOneThread);
                benchmark::DoNotOptimize(results.data());
            }
            bench::SetItems(state, double(count), "table");
        };
        made.baseline = [=](benchmark::State& state) {
            std::vector<Result> results(numPlain);
            for (auto _ : state) {
                for (size_t place = 0; place < numPlain; ++place)
                    results[place] = operation.plain((*tables)[place], place);
                benchmark::DoNotOptimize(results.data());
            }
            bench::SetItems(state, double(numPlain), "table");
        };
        return made;
    });
}

// A million tables in two threads.
template <class Result>
void AddMillion(const std::string& name, const Operation<Result>& operation, size_t numPlain)
{
    bench::AddByClock(name, [=] {
        const auto tables = std::make_shared<Tables>(RandomTables(kNumAllTables));
        bench::Case made;
        made.isRight = [=] {
            std::vector<Result> results(kNumAllTables);
            operation.work(LutsOf(*tables, kNumInputs), results.data(), kTwoThreads);
            return IsAsPlain(operation, *tables, results, numPlain);
        };
        made.ours = [=](benchmark::State& state) {
            std::vector<Result> results(kNumAllTables);
            for (auto _ : state) {
                const auto start = std::chrono::steady_clock::now();
                operation.work(LutsOf(*tables, kNumInputs), results.data(), kTwoThreads);
                const std::chrono::duration<double> taken =
                    std::chrono::steady_clock::now() - start;
                state.SetIterationTime(taken.count());
            }
            bench::SetItems(state, double(kNumAllTables), "table");
        };
        return made;
    });
}

template <class Result>
void AddBoth(const std::string& name, const Operation<Result>& operation, size_t numPlain)
{
    AddOperation(name + "/one_thread", operation, numPlain);
    AddMillion(name + "/million", operation, numPlain);
}

void FindForms(const LutArray& luts, uint64_t* forms, const LutWork& work)
{
    FindCanonicals(luts, CanonicalScope::OrderAndInversions, forms, nullptr, work);
}

// Functions with very similar inputs, and where at first no choice is better than the others.
Tables HardTables()
{
    Tables tables = {0x6996966996696996,  // all six inputs differ from each other
                     0x8777788878887888,  // bent
                     0x9669699669969669,  // its inversion with one input inverted
                     0x40d0850204000020,  // found by climbing from sparse ones
                     0x0442850104000020,  // sparse
                     0x0000080000012100,  // four rows
                     0xfee8e880e8808000}; // four or more of six
    return tables;
}

bench::Case MakeHard()
{
    bench::Case made;
    made.isRight = [] {
        const Tables tables = HardTables();
        Tables forms(tables.size());
        FindForms(LutsOf(tables, kNumInputs), forms.data(), kOneThread);
        return std::equal(tables.begin(), tables.end(), forms.begin(),
                          [](uint64_t table, uint64_t form) { return TryAll(table) == form; });
    };
    made.ours = [](benchmark::State& state) {
        const Tables tables = HardTables();
        Tables forms(tables.size());
        for (auto _ : state)
            FindForms(LutsOf(tables, kNumInputs), forms.data(), kOneThread);
        bench::SetItems(state, double(tables.size()), "table");
    };
    return made;
}

bench::Case MakeTexts()
{
    static const std::vector<std::string> inputs = {"A", "B", "C", "D", "E", "F"};
    bench::Case made;
    made.isRight = [] { // texts are proved where they are made; here each table must have one
        const LutTexts found = DescribeLuts(LutsOf(RandomTables(kNumTexts), kNumInputs), inputs);
        return found.texts.size() == kNumTexts &&
               std::all_of(found.texts.begin(), found.texts.end(),
                           [](const LutText& text) { return !text.shortForm.empty(); });
    };
    made.ours = [](benchmark::State& state) {
        const Tables tables = RandomTables(kNumTexts);
        for (auto _ : state)
            benchmark::DoNotOptimize(
                DescribeLuts(LutsOf(tables, kNumInputs), inputs, nullptr, kOneThread));
        bench::SetItems(state, double(kNumTexts), "function");
    };
    return made;
}

} // namespace

void bench::AddCases()
{
    static const Bytes orders = RandomOrders(kNumAllTables);
    AddBoth<uint64_t>("permute",
                      {[](const LutArray& luts, uint64_t* results, const LutWork& work) {
                           PermuteLuts(luts, kOrder, results, work);
                       },
                       [](uint64_t table, size_t) { return PermutePlainly(table, kOrder); }},
                      kNumTables);
    AddBoth<uint64_t>("permute_each",
                      {[](const LutArray& luts, uint64_t* results, const LutWork& work) {
                           PermuteLutsEach(luts, orders.data(), results, work);
                       },
                       [](uint64_t table, size_t place) {
                           return PermutePlainly(table, &orders[kNumInputs * place]);
                       }},
                      kNumTables);
    AddBoth<uint8_t>("support",
                     {[](const LutArray& luts, uint8_t* results, const LutWork& work) {
                          FindLutSupports(luts, results, work);
                      },
                      [](uint64_t table, size_t) { return SupportPlainly(table); }},
                     kNumTables);
    AddBoth<uint8_t>("count",
                     {[](const LutArray& luts, uint8_t* results, const LutWork& work) {
                          CountLutOnes(luts, results, work);
                      },
                      [](uint64_t table, size_t) { return CountPlainly(table); }},
                     kNumTables);
    const Operation<uint64_t> forms = {FindForms,
                                       [](uint64_t table, size_t) { return TryAll(table); }};
    AddBoth("npn", forms, kNumTried);
    AddSingle("npn_hard", MakeHard);
    AddSingle("texts", MakeTexts);
}
