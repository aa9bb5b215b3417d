// Functions and expressions as objects of booleq.Equation.
#ifndef BOOLEQ_PYTHON_ALGEBRA_H
#define BOOLEQ_PYTHON_ALGEBRA_H

#include "equation.h"

namespace booleq_python {

// An init value over the function's inputs; 0 or 1 without inputs.
py::object GiveFunction(const booleq::Function& function);
// With the parentheses that it needs; its inputs are listed unless the text has them in order.
py::object GiveExpression(const booleq::Expression& expression);

} // namespace booleq_python

#endif
