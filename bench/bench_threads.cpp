// One thread, then two at the same time, each with its own objects: how much more two get done.
// A repetition times one thread and two in turn by the clock, from a common start to the end of the
// last. Its ratio is the work done in the same time: 2 where threads do not get in each other's
// way.
#include <algorithm>
#include <atomic>
#include <chrono>
#include <memory>
#include <thread>

#include <Kq_BoolEquation.h>

#include "support/cases.h"
#include "support/texts.h"

namespace {

typedef std::chrono::steady_clock Clock;
typedef Port::StringBase<char> String;

const size_t kNumTokens = 12;
const size_t kNumKnownNames = 1000;
const size_t kNumTexts = 1000;
const double kMinSeconds = 0.01; // of one thread's work in one measurement

// What a thread does 'numUnits' times. It is made in the thread, before the clock starts, with
// everything that it works on.
typedef std::function<void()> Run;
typedef std::function<Run(size_t thread, size_t numUnits)> MakeRun;

struct Work {
    std::function<bool(size_t thread)> isRight; // runs in two threads at once
    MakeRun makeRun;
    const char* unit;
};

void InThreads(size_t numThreads, const std::function<void(size_t thread)>& work)
{
    std::vector<std::thread> threads;
    for (size_t thread = 0; thread < numThreads; ++thread)
        threads.emplace_back(work, thread);
    for (std::thread& thread : threads)
        thread.join();
}

// Seconds from the start of all threads to the end of the last.
double Measure(const MakeRun& makeRun, size_t numThreads, size_t numUnits)
{
    std::atomic<size_t> numReady{0};
    std::vector<Clock::time_point> starts(numThreads);
    std::vector<Clock::time_point> ends(numThreads);
    InThreads(numThreads, [&](size_t thread) {
        const Run run = makeRun(thread, numUnits);
        for (++numReady; numReady < numThreads;) // on two cores no thread waits for long
            ;
        starts[thread] = Clock::now();
        run();
        ends[thread] = Clock::now();
    });
    return std::chrono::duration<double>(*std::max_element(ends.begin(), ends.end()) -
                                         *std::min_element(starts.begin(), starts.end()))
        .count();
}

size_t FindNumUnits(const MakeRun& makeRun)
{
    size_t numUnits = 16;
    while (Measure(makeRun, 1, numUnits) < kMinSeconds)
        numUnits *= 2;
    return numUnits;
}

bench::Case MakeCase(const Work& work)
{
    bench::Case made;
    made.isRight = [work] {
        std::atomic<bool> isRight{true};
        InThreads(2, [&](size_t thread) {
            for (int count = 0; count < 3; ++count) {
                if (!work.isRight(thread))
                    isRight = false;
            }
        });
        return isRight.load();
    };
    const std::shared_ptr<size_t> numUnits = std::make_shared<size_t>(0);
    made.ours = [work, numUnits](benchmark::State& state) {
        if (*numUnits == 0)
            *numUnits = FindNumUnits(work.makeRun);
        double one = 0.0;
        double two = 0.0;
        for (auto _ : state) {
            // In turn and in both orders, so that a moment in which the machine is slow hits both.
            const double before = one + two;
            one += Measure(work.makeRun, 1, *numUnits);
            two += Measure(work.makeRun, 2, *numUnits);
            two += Measure(work.makeRun, 2, *numUnits);
            one += Measure(work.makeRun, 1, *numUnits);
            state.SetIterationTime(one + two - before);
        }
        const double numRuns = 2.0 * double(state.iterations()) * double(*numUnits);
        state.counters["one_thread"] = one / numRuns * 1e9;
        state.counters["two_threads"] = two / numRuns * 1e9;
        state.counters["ratio"] = 2.0 * one / two;
        bench::SetItems(state, 6.0 * double(*numUnits), work.unit); // by one, two, two and one
    };
    return made;
}

// Texts of 12 tokens over a thousand names, different ones for each thread.
std::vector<String> MakeKnownTexts(size_t thread)
{
    std::vector<String> texts;
    for (size_t number = 0; number < kNumTexts; ++number) {
        const unsigned int seed = static_cast<unsigned int>(1 + 2 * number + thread);
        texts.push_back(bench::MakeTypical(kNumTokens, kNumKnownNames, seed).c_str());
    }
    return texts;
}

// The same with names that are new in this process.
std::vector<String> MakeNewTexts(size_t numTexts)
{
    static std::atomic<size_t> numMade{0};
    static const std::vector<String> known = MakeKnownTexts(0);
    std::vector<String> texts;
    for (size_t number = 0; number < numTexts; ++number) {
        const std::string prefix = "n" + std::to_string(numMade++) + "_";
        String text;
        for (const char* rest = known[number % kNumTexts].c_str(); *rest; ++rest) {
            if (*rest == 'x')
                text += prefix.c_str();
            text += *rest;
        }
        texts.push_back(text);
    }
    return texts;
}

std::string WithoutBlanks(const String& text)
{
    std::string closed = text.c_str();
    closed.erase(std::remove(closed.begin(), closed.end(), ' '), closed.end());
    return closed;
}

// Each text comes back from the tree, and has as many tokens as it should have.
bool AreSetRightly(const std::vector<String>& texts)
{
    return std::all_of(texts.begin(), texts.end(), [](const String& text) {
        Kq_BoolEquation equation;
        return equation.SetEquation(text) &&
               WithoutBlanks(text) == equation.GetEquation(false).c_str() &&
               bench::CountNodes(equation.GetImp()->GetRoot()) == kNumTokens;
    });
}

Run RunSetting(const std::vector<String>& texts, size_t numUnits)
{
    return [texts, numUnits] {
        for (size_t unit = 0; unit < numUnits; ++unit) {
            Kq_BoolEquation equation;
            benchmark::DoNotOptimize(equation.SetEquation(texts[unit % texts.size()]));
        }
    };
}

Work MakeSettingKnown()
{
    return {
        [](size_t thread) { return AreSetRightly(MakeKnownTexts(thread)); },
        [](size_t thread, size_t numUnits) { return RunSetting(MakeKnownTexts(thread), numUnits); },
        "equation"};
}

Work MakeSettingNew()
{
    return {[](size_t) { return AreSetRightly(MakeNewTexts(kNumTexts)); },
            [](size_t, size_t numUnits) { return RunSetting(MakeNewTexts(numUnits), numUnits); },
            "equation"};
}

typedef std::shared_ptr<Kq_BoolEquation> EquationPointer;

// All names of a text with 'numOperators' over 'numVariables' occur.
EquationPointer MakeEquation(size_t numVariables, size_t numOperators)
{
    return std::make_shared<Kq_BoolEquation>(
        bench::MakeWide(2 * numOperators + 1, numVariables).c_str());
}

bool GetBit(const std::vector<uint64_t>& words, size_t row)
{
    return (words[row / 64] >> row % 64 & 1u) != 0;
}

void SetRow(Kq_BoolEquation& equation, const std::vector<Kq_BoolEquation::Handle>& handles,
            size_t row)
{
    for (size_t index = 0; index < handles.size(); ++index)
        equation.SetVariable(handles[index], row >> (handles.size() - 1 - index) & 1u);
}

std::vector<Kq_BoolEquation::Handle> GetHandles(const Kq_BoolEquation& equation)
{
    std::vector<Kq_BoolEquation::Handle> handles;
    for (const auto& variable : equation.GetVariables())
        handles.push_back(equation.GetVariableHandle(variable.first));
    return handles;
}

// The column agrees with single evaluations of every row; its digits go to 'digits'.
bool IsColumnRight(Kq_BoolEquation& equation, size_t numVariables, std::string* digits)
{
    std::vector<uint64_t> words;
    if (equation.GetNumVariables() != numVariables || !equation.GetColumn(words))
        return false;
    const std::vector<Kq_BoolEquation::Handle> handles = GetHandles(equation);
    for (size_t row = 0; row < size_t(1) << numVariables; ++row) {
        SetRow(equation, handles, row);
        if (equation.Eval() != GetBit(words, row))
            return false;
    }
    *digits = bench::WriteInitValue(words, static_cast<unsigned int>(numVariables));
    return true;
}

Work MakeEvaluation()
{
    return {[](size_t) {
                std::string digits;
                return IsColumnRight(*MakeEquation(6, 20), 6, &digits);
            },
            [](size_t, size_t numUnits) -> Run {
                const EquationPointer equation = MakeEquation(6, 20);
                const std::vector<Kq_BoolEquation::Handle> handles = GetHandles(*equation);
                return [=] {
                    for (size_t unit = 0; unit < numUnits; ++unit) {
                        SetRow(*equation, handles, unit);
                        benchmark::DoNotOptimize(equation->Eval());
                    }
                };
            },
            "value"};
}

Work MakeHexText()
{
    return {[](size_t) {
                const EquationPointer equation = MakeEquation(6, 20);
                std::string digits;
                return IsColumnRight(*equation, 6, &digits) &&
                       digits == equation->GetEquationAsHexInitValue(false).c_str();
            },
            [](size_t, size_t numUnits) -> Run {
                const EquationPointer equation = MakeEquation(6, 20);
                return [=] {
                    for (size_t unit = 0; unit < numUnits; ++unit)
                        benchmark::DoNotOptimize(equation->GetEquationAsHexInitValue(false));
                };
            },
            "text"};
}

Work MakeColumn()
{
    return {[](size_t) {
                std::string digits;
                return IsColumnRight(*MakeEquation(16, 32), 16, &digits);
            },
            [](size_t, size_t numUnits) -> Run {
                const EquationPointer equation = MakeEquation(16, 32);
                return [=] {
                    std::vector<uint64_t> words;
                    for (size_t unit = 0; unit < numUnits; ++unit)
                        benchmark::DoNotOptimize(equation->GetColumn(words));
                };
            },
            "column"};
}

} // namespace

void bench::AddCases()
{
    AddByClock("threads/set_known_names", [] { return MakeCase(MakeSettingKnown()); });
    AddByClock("threads/set_new_names", [] { return MakeCase(MakeSettingNew()); });
    AddByClock("threads/eval", [] { return MakeCase(MakeEvaluation()); });
    AddByClock("threads/hex_text_6_inputs", [] { return MakeCase(MakeHexText()); });
    AddByClock("threads/column_16_inputs", [] { return MakeCase(MakeColumn()); });
}
