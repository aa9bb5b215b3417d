// Refusals as exceptions, and the way out of long calls.
#ifndef BOOLEQ_PYTHON_ERRORS_H
#define BOOLEQ_PYTHON_ERRORS_H

#include <pybind11/pybind11.h>

#include "refusal.h"

namespace booleq_python {

namespace py = pybind11;

// Raises booleq.ParseError for a refused text; the report counts bytes, the exception characters.
[[noreturn]] void RaiseParseError(const py::str& text, const booleq::RefusalReport& report);

// Runs the handlers of signals that came.  Fails: what a handler raises, such as KeyboardInterrupt.
void CheckSignals();

// The class of that name among the results that are written in Python.
py::object ResultClass(const char* name);

} // namespace booleq_python

#endif
