// The functions that the Python half of the module calls, a file for each group. booleq/*.py passes
// their arguments by position and checks users' arguments where messages are best written in
// Python.
#ifndef BOOLEQ_PYTHON_BIND_H
#define BOOLEQ_PYTHON_BIND_H

#include <pybind11/pybind11.h>

#include "equation.h"

namespace booleq_python {

void BindTexts(py::module_& module);     // renderings, init values, other notations
void BindBatch(py::module_& module);     // tables of functions, completed
void BindMany(py::module_& module);      // equations by the thousand
void BindAlgebra(py::module_& module);   // equations made from equations
void BindQuestions(py::module_& module); // deciding, counting and matching
void BindArrays(py::module_& module);    // many rows at once
void BindLuts(py::module_& module);      // arrays of look-up tables
void BindNetlists(py::module_& module);  // netlists, read and compared
void BindMinimize(py::module_& module);  // smallest sums of products
void BindReports(py::module_& module);   // trees, maps, explanations, lint

} // namespace booleq_python

#endif
