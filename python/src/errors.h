// Raises exceptions for refusals.
#ifndef BOOLEQ_PYTHON_ERRORS_H
#define BOOLEQ_PYTHON_ERRORS_H

#include <string>

#include <pybind11/pybind11.h>

#include "refusal.h"

namespace booleq_python {

namespace py = pybind11;

// Raises booleq.ParseError for a text that is refused when it is read that way.
[[noreturn]] void RaiseParseError(const py::str& text, const std::string& bytes,
                                  const booleq::Reading& reading);
// The report counts bytes, the exception characters.
[[noreturn]] void RaiseParseError(const py::str& text, const booleq::RefusalReport& report);

// The class of that name in booleq/_results.py.
py::object ResultClass(const char* name);

} // namespace booleq_python

#endif
