// The canonical form: two tables have the same one if and only if they are the same function up to
// the order of inputs, or up to inversions too. In: tables of up to six inputs; out: the form, and
// how the table becomes it.
// Fails: for arrays, as lut_array.h says.  Cost: under a microsecond for a random table of six
// inputs; never more than all 92,160 transformations.
#ifndef BOOLEQ_LUTS_CANONICAL_H
#define BOOLEQ_LUTS_CANONICAL_H

#include "lut_array.h"
#include "lut_transformation.h"

namespace booleq {

constexpr unsigned int kMaxCanonicalInputs = kMaxTransformedInputs;

// What may differ between tables that have the same form.
enum class CanonicalScope {
    Order,             // only the order of inputs
    OrderAndInversions // also inversions of inputs and output ("NPN")
};

struct CanonicalLut {
    uint64_t form = 0; // the least of all tables, as numbers, that the scope's transformations make
    LutTransformation transformation; // makes the form from the table
};

// Requires: at most kMaxCanonicalInputs inputs; no bit beyond the last row. Idle inputs count as
// inputs: no input is dropped before the search.
CanonicalLut FindCanonical(uint64_t table, unsigned int numInputs, CanonicalScope scope);

// All tables of an array.  'forms' is an array of the same shape and may be the same memory;
// 'transformations' has an element for each table, or is null.
void FindCanonicals(const LutArray& luts, CanonicalScope scope, void* forms,
                    LutTransformation* transformations, const LutWork& work = LutWork());

} // namespace booleq

#endif
