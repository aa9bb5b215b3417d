// Formulas made at build time, and the choice of the kernel that runs fastest here.
#include "formulas.h"

#include <chrono>
#include <limits>

#include "kernels.h"

namespace bench {

namespace {

#define COLUMN_TEXT(kind, seed, numVariables, numOperators, text)                                  \
    {kind, seed, numVariables, numOperators, text, 0},
#define EVAL_TEXT(kind, seed, numVariables, numOperators, text)
const Formula kColumnFormulas[] = {
#include "formula_table.inc"
};
#undef COLUMN_TEXT
#undef EVAL_TEXT

#define COLUMN_TEXT(kind, seed, numVariables, numOperators, text)
#define EVAL_TEXT(kind, seed, numVariables, numOperators, text)                                    \
    {kind, seed, numVariables, numOperators, text, 0},
const Formula kEvalFormulas[] = {
#include "formula_table.inc"
};

template <size_t kSize>
std::vector<Formula> Select(const Formula (&formulas)[kSize], unsigned int numVariables)
{
    std::vector<Formula> selected;
    for (size_t index = 0; index < kSize; ++index) {
        if (formulas[index].numVariables != numVariables)
            continue;
        selected.push_back(formulas[index]);
        selected.back().index = index;
    }
    return selected;
}

struct Target {
    const char* name;
    const KernelRow* kernels;
};

std::vector<Target> GetTargets()
{
    std::vector<Target> targets(1, Target{"plain", plain::kKernels});
#if defined(__x86_64__)
    if (__builtin_cpu_supports("avx2"))
        targets.push_back(Target{"avx2", avx2::kKernels});
    if (__builtin_cpu_supports("avx512f") && __builtin_cpu_supports("avx512bw") &&
        __builtin_cpu_supports("avx512vl") && __builtin_cpu_supports("avx512dq"))
        targets.push_back(Target{"avx512", avx512::kKernels});
#endif
    return targets;
}

// The shortest of several runs, in nanoseconds.
double TimeKernel(Kernel kernel, uint64_t numWords, uint64_t* words)
{
    typedef std::chrono::steady_clock Clock;
    const int numRuns = numWords > 100000 ? 5 : 200;
    double shortest = std::numeric_limits<double>::max();
    for (int run = 0; run < numRuns; ++run) {
        const Clock::time_point start = Clock::now();
        kernel(words);
        const std::chrono::duration<double, std::nano> taken = Clock::now() - start;
        shortest = taken.count() < shortest ? taken.count() : shortest;
    }
    return shortest;
}

} // namespace

std::vector<Formula> GetColumnFormulas(unsigned int numVariables)
{
    return Select(kColumnFormulas, numVariables);
}

std::vector<Formula> GetEvalFormulas(unsigned int numVariables)
{
    return Select(kEvalFormulas, numVariables);
}

Kernel FindFastestKernel(const Formula& formula, uint64_t* words, std::string* name)
{
    Kernel fastest = nullptr;
    double shortest = std::numeric_limits<double>::max();
    for (const Target& target : GetTargets()) {
        for (size_t block = 0; block < kNumBlockSizes; ++block) {
            const Kernel kernel = target.kernels[formula.index][block];
            const double taken = TimeKernel(kernel, formula.GetNumWords(), words);
            if (taken >= shortest)
                continue;
            shortest = taken;
            fastest = kernel;
            *name = std::string(target.name) + ", " + std::to_string(16u << block) + " words";
        }
    }
    return fastest;
}

void SetFormula(const Formula& formula, Kq_BoolEquation& equation)
{
    std::vector<Port::StringBase<char>> terms;
    for (unsigned int variable = 0; variable < formula.numVariables; ++variable)
        terms.push_back(("x" + std::to_string(variable)).c_str());
    equation.SetEquationWithExplicitTerms(terms, formula.text, false, false);
}

std::vector<uint64_t> EvaluateColumn(const Kq_BoolEquation& equation)
{
    const unsigned int numVariables = equation.GetNumVariables();
    const uint64_t numRows = uint64_t(1) << numVariables;
    std::vector<uint64_t> words((numRows + 63) / 64);
    Kq_BoolEquation copy(equation);
    std::vector<Kq_BoolEquation::Handle> handles;
    for (unsigned int variable = 0; variable < numVariables; ++variable)
        handles.push_back(copy.GetVariableHandle(copy.GetVariables()[variable].first));
    for (uint64_t row = 0; row < numRows; ++row) {
        for (unsigned int variable = 0; variable < numVariables; ++variable)
            copy.SetVariable(handles[variable], row >> (numVariables - 1 - variable) & 1u);
        words[row / 64] |= uint64_t(copy.Eval()) << (row % 64);
    }
    return words;
}

} // namespace bench
