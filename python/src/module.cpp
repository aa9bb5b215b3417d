// The compiled half of the package booleq. The interpreter's lock is never released: the library
// is for one thread at a time in a process, and that is who holds the lock.
#include <pybind11/pybind11.h>

#include "bind.h"
#include "errors.h"
#include "watch.h"

namespace {

constexpr char kEquationDoc[] = R"doc(Equation(text, inputs=None, lsb_first=False)
--

A Boolean equation, as text or as an init value over listed inputs.

text is an expression in any accepted syntax, or with inputs also an init value, "0x8" or
"0b1000". inputs are names, the most significant first; names that only the text has follow them.
lsb_first takes the first input of an init value for bit 0 of the row number.

An equation is a mapping of its inputs to their values, all 0 at first.

>>> from booleq import Equation
>>> eq = Equation("A & ~B")
>>> eq.inputs
('A', 'B')
>>> eq(A=1, B=0)
1
>>> Equation("0x4", ["A", "B"]).expression
'( A & ~ B )'

A text that is refused raises ParseError, which knows the place and often the hint. A name that is
none, or is listed twice, is a ValueError.

>>> Equation("A && B")
Traceback (most recent call last):
    ...
booleq.ParseError: refused at character 3: the operator '&' has no operand on its right; write '&' for '&&'
)doc";

} // namespace

PYBIND11_MODULE(_booleq, module)
{
    using namespace booleq_python;
    py::options options;
    options.disable_function_signatures(); // docstrings have them
    module.attr("__version__") = BOOLEQ_VERSION;

    EquationClass type(module, "Equation", py::is_final(), kEquationDoc);
    type.attr("__module__") = "booleq"; // where it is imported from, for help() and pickles
    booleq::SetWatch(CheckSignals);     // interrupts end long calls

    BindTexts(type);
    BindMapping(type);
    BindArrays(module, type);
    BindMinimize(module, type);
    BindReports(type);
    py::module_::import("collections.abc").attr("Mapping").attr("register")(type);
}
