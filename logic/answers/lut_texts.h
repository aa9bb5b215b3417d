// What very many look-up tables are, in words and as short expressions, made once for each distinct
// function.
#ifndef BOOLEQ_ANSWERS_LUT_TEXTS_H
#define BOOLEQ_ANSWERS_LUT_TEXTS_H

#include <string>
#include <vector>

#include "distinct_luts.h"

namespace booleq {

// Of one function over the inputs that were named.
struct LutText {
    std::string kind;       // "multiplexer", "AND", ...; empty for one without a name (kind.h)
    std::string name;       // the kind with its inputs, an inverted one as "~A"
    std::string shortForm;  // a text for Kq_BoolEquation, as 'explain' prints it (short_form.h)
    size_t numLiterals = 0; // how often it mentions inputs
    bool isMinimal = false; // proved: none of & | ^ ~ mentions inputs fewer times
};

struct LutTexts {
    DistinctLuts distinct;
    std::vector<LutText> texts; // one for each distinct table
};

// 'distinctPlaces', if it is not null, gets for each table its place in the texts.
// Requires: as many names as the tables have inputs, all different.
// Fails: std::bad_alloc, and what Watch() throws.
// Cost: up to a tenth of a millisecond for each distinct function of six inputs.
LutTexts DescribeLuts(const LutArray& luts, const std::vector<std::string>& inputs,
                      uint64_t* distinctPlaces = nullptr, const LutWork& work = LutWork());

} // namespace booleq

#endif
