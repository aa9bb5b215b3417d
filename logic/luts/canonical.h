// One table for all that are one function up to the order of inputs, or up to inversions too: two
// have the same form if and only if they are. In: tables of up to six inputs; out: the form, and
// how the table becomes it. Fails: an array's work as lut_array.h says.  Cost: below a microsecond
// for six random inputs; never more than all 92,160 transformations.
#ifndef BOOLEQ_LUTS_CANONICAL_H
#define BOOLEQ_LUTS_CANONICAL_H

#include "lut_array.h"
#include "lut_transformation.h"

namespace booleq {

constexpr unsigned int kMaxCanonicalInputs = kMaxTransformedInputs;

// What may differ between tables of one form.
enum class CanonicalScope {
    Order,             // the order of inputs alone
    OrderAndInversions // and inversions of inputs and of the output ("NPN")
};

struct CanonicalLut {
    uint64_t form = 0; // the least number of all tables that the scope's transformations make
    LutTransformation transformation; // makes the form of the table
};

// Requires: at most kMaxCanonicalInputs inputs; no bit beyond the last row. Idle inputs count as
// inputs: tables of one width are compared as they are.
CanonicalLut FindCanonical(uint64_t table, unsigned int numInputs, CanonicalScope scope);

// All tables of an array.  'forms' has tables of its shape, and may be the same memory;
// 'transformations' has an element for each, or is null.
void FindCanonicals(const LutArray& luts, CanonicalScope scope, void* forms,
                    LutTransformation* transformations, const LutWork& work = LutWork());

} // namespace booleq

#endif
