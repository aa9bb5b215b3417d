// Registration, the check before the timing, and main.
#include "cases.h"

#include <memory>
#include <vector>

namespace bench {

namespace {

bool allRight = true;

// A case that is made and checked when it is first needed.
struct Lazy {
    std::function<Case()> make;
    Case made;
    bool isMade;
    bool isRight;

    explicit Lazy(std::function<Case()> maker) : make(maker), isMade(false), isRight(false) {}

    bool IsRight()
    {
        if (isMade)
            return isRight;
        isMade = true;
        made = make();
        isRight = made.isRight();
        allRight = allRight && isRight;
        return isRight;
    }
};

benchmark::internal::Benchmark* Register(const std::string& name, std::shared_ptr<Lazy> lazy,
                                         Body Case::*body)
{
    return benchmark::RegisterBenchmark(name.c_str(), [lazy, body](benchmark::State& state) {
        if (lazy->IsRight())
            (lazy->made.*body)(state);
        else
            state.SkipWithError("wrong answer");
    });
}

} // namespace

void AddPair(const std::string& name, std::function<Case()> make)
{
    const std::shared_ptr<Lazy> lazy = std::make_shared<Lazy>(make);
    Register(name + "/ours", lazy, &Case::ours);
    Register(name + "/baseline", lazy, &Case::baseline);
}

void AddSingle(const std::string& name, std::function<Case()> make)
{
    Register(name + "/ours", std::make_shared<Lazy>(make), &Case::ours);
}

void AddByClock(const std::string& name, std::function<Case()> make)
{
    Register(name + "/by_clock", std::make_shared<Lazy>(make), &Case::ours)->UseManualTime();
}

void SetItems(benchmark::State& state, double numItems, const char* unit)
{
    state.counters["items"] = numItems;
    state.counters[std::string("per_") + unit] =
        benchmark::Counter(numItems * double(state.iterations()),
                           benchmark::Counter::kIsRate | benchmark::Counter::kInvert);
}

} // namespace bench

// By default, repetitions run in a random order, so that a slow moment of the machine does not hit
// only one side of a pair. Options on the command line come later and take precedence.
int main(int argc, char** argv)
{
    std::vector<std::string> options = {
        argv[0], "--benchmark_repetitions=7", "--benchmark_min_time=0.05",
        "--benchmark_enable_random_interleaving=true", "--benchmark_display_aggregates_only=true"};
    options.insert(options.end(), argv + 1, argv + argc);
    std::vector<char*> pointers;
    for (std::string& option : options)
        pointers.push_back(&option[0]);
    int numPointers = int(pointers.size());
    pointers.push_back(nullptr);

    benchmark::AddCustomContext("compiler", BENCH_COMPILER);
    benchmark::AddCustomContext("flags", BENCH_FLAGS);
    bench::AddCases();
    benchmark::Initialize(&numPointers, pointers.data());
    if (benchmark::ReportUnrecognizedArguments(numPointers, pointers.data()))
        return 2;
    benchmark::RunSpecifiedBenchmarks();
    benchmark::Shutdown();
    return bench::allRight ? 0 : 1;
}
