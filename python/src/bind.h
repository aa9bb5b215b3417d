// The functions that Python's half of the module calls, a file for each group. Their arguments come
// by position from booleq/*.py, which checks what users give where Python's words do it best.
#ifndef BOOLEQ_PYTHON_BIND_H
#define BOOLEQ_PYTHON_BIND_H

#include <pybind11/pybind11.h>

#include "equation.h"

namespace booleq_python {

void BindTexts(py::module_& module);     // renderings, init values, other notations
void BindBatch(py::module_& module);     // tables of functions completed
void BindMany(py::module_& module);      // equations by the thousand
void BindAlgebra(py::module_& module);   // equations made of equations
void BindQuestions(py::module_& module); // what is decided, counted and matched
void BindArrays(py::module_& module);    // many rows at once
void BindLuts(py::module_& module);      // arrays of look-up tables
void BindNetlists(py::module_& module);  // netlists read and compared
void BindMinimize(py::module_& module);  // smallest sums
void BindReports(py::module_& module);   // trees, maps, explanations, lint

} // namespace booleq_python

#endif
