// What the two sources of the program share. The objects of static_equation.cpp are made first and
// destroyed last, because the program is linked in that order.
#ifndef STATIC_EQUATION_H
#define STATIC_EQUATION_H

#include <Kq_BoolEquation.h>

// A static object: "a_static_equation_with_a_long_name & ~B".
Kq_BoolEquation& StaticEquation();

// Ends the program with status 1 unless 'condition' holds.
void Require(bool condition, const char* what);

#endif
