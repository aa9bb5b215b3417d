// The members of booleq.Equation, a file for each group.
// The first line of a docstring is the signature that inspect, help() and the check of the stubs
// read. Its first argument stands for what the function is bound to inside, and is not shown.
#ifndef BOOLEQ_PYTHON_BIND_H
#define BOOLEQ_PYTHON_BIND_H

#include <pybind11/pybind11.h>

#include "equation.h"

namespace booleq_python {

typedef py::class_<Equation> EquationClass;

void BindTexts(EquationClass& type);   // construction, renderings, equality, copies
void BindMapping(EquationClass& type); // values of inputs, evaluation
void BindArrays(py::module_& module, EquationClass& type);   // many rows at once
void BindMinimize(py::module_& module, EquationClass& type); // smallest sums
void BindReports(EquationClass& type);                       // trees and what the searches find

} // namespace booleq_python

#endif
