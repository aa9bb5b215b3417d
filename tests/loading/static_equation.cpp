// An equation that is a static object in a different source than 'main'.
#include "loading/static_equation.h"

#include <cstdio>
#include <cstdlib>

namespace {

// Made before the equation, so destroyed after it: the library works to the very end.
struct Last {
    ~Last()
    {
        Kq_BoolEquation equation("A ^ a_name_that_comes_up_at_the_end");
        equation.SetVariable("A", 1);
        Require(equation.Eval() == 1, "the very end");
        std::puts("all is well");
        std::fflush(stdout);
    }
};
Last s_last;

Kq_BoolEquation s_equation("a_static_equation_with_a_long_name & ~B");

} // namespace

Kq_BoolEquation& StaticEquation()
{
    return s_equation;
}

void Require(bool condition, const char* what)
{
    if (condition)
        return;
    std::printf("failed: %s\n", what);
    std::fflush(stdout);
    std::_Exit(1);
}
