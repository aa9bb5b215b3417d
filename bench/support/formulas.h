// The formulas of formulas.py: text, compiled function and hand-written column kernels.
// Kernels and functions are what the library is compared with, so they are as fast as C++ gets.
#ifndef BENCH_FORMULAS_H
#define BENCH_FORMULAS_H

#include <cstddef>
#include <cstdint>
#include <string>
#include <vector>

#include <Kq_BoolEquation.h>

namespace bench {

// Writes the whole result column, bit k of it being the value of row k.
typedef void (*Kernel)(uint64_t* words);

// The value for values[i] (0 or 1) of variable i.
typedef unsigned int (*Function)(const unsigned int* values);

struct Formula {
    const char* kind;
    unsigned int seed;
    unsigned int numVariables; // x0, x1, ...; not all of them need to occur
    unsigned int numOperators;
    const char* text;
    size_t index; // among those with a kernel, or among those with a function

    std::string GetName() const { return std::string(kind) + "/" + std::to_string(seed); }
    uint64_t GetNumWords() const
    {
        return numVariables > 6 ? uint64_t(1) << (numVariables - 6) : 1;
    }
};

// Formulas with a column kernel, and formulas with a compiled function.
std::vector<Formula> GetColumnFormulas(unsigned int numVariables);
std::vector<Formula> GetEvalFormulas(unsigned int numVariables);

Function GetFunction(const Formula& formula);

// The kernel that fills 'words' in the shortest time, among those for this processor's instruction
// sets and for several block sizes. 'name' says which one it is.
Kernel FindFastestKernel(const Formula& formula, uint64_t* words, std::string* name);

// Sets 'equation' to the formula over all its variables, x0 first.
void SetFormula(const Formula& formula, Kq_BoolEquation& equation);

// The result column by 2^n evaluations, without any kernel or column.
std::vector<uint64_t> EvaluateColumn(const Kq_BoolEquation& equation);

} // namespace bench

#endif
