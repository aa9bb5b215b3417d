// Cases of a benchmark executable: what is timed, what it is compared with, and the check of the
// answer that comes before both.
#ifndef BENCH_CASES_H
#define BENCH_CASES_H

#include <functional>
#include <string>

#include <benchmark/benchmark.h>

namespace bench {

typedef std::function<void(benchmark::State&)> Body;

struct Case {
    std::function<bool()> isRight; // runs once, outside the clock
    Body ours;
    Body baseline; // empty for a case on its own
};

// Registers NAME/ours and NAME/baseline. Nothing is set up until one of the two runs; a case whose
// answer is wrong is not timed, and the executable then ends with status 1.
void AddPair(const std::string& name, std::function<Case()> make);
// Registers NAME/ours alone.
void AddSingle(const std::string& name, std::function<Case()> make);
// Registers NAME/by_clock alone, whose 'ours' reports each iteration's time itself: for work of
// several threads, which processor time cannot measure.
void AddByClock(const std::string& name, std::function<Case()> make);

// Reports the work of one iteration, so that time per item can be given: 'unit' is "token", "row".
void SetItems(benchmark::State& state, double numItems, const char* unit);

// Defined by each executable: adds all its cases.
void AddCases();

} // namespace bench

#endif
