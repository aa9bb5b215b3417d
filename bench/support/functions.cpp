// The formulas as compiled functions of single values.
#include "formulas.h"

namespace {

template <size_t kIndex>
struct Expression;

#define EVAL_FORMULA(index, value)                                                                 \
    template <>                                                                                    \
    struct Expression<index> {                                                                     \
        static __attribute__((noinline)) unsigned int Get(const unsigned int* v) { return value; } \
    };
#include "eval_formulas.inc"
#undef EVAL_FORMULA

#define EVAL_FORMULA(index, value) Expression<index>::Get,
const bench::Function kFunctions[] = {
#include "eval_formulas.inc"
};

} // namespace

bench::Function bench::GetFunction(const Formula& formula)
{
    return kFunctions[formula.index];
}
