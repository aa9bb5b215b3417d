// What very many look-up tables are, in words and as short expressions, found once for each
// distinct function.
#ifndef BOOLEQ_ANSWERS_LUT_TEXTS_H
#define BOOLEQ_ANSWERS_LUT_TEXTS_H

#include <string>
#include <vector>

#include "distinct_luts.h"

namespace booleq {

// The text of one function over the given inputs.
struct LutText {
    std::string kind;       // "multiplexer", "AND", ...; empty if it has no name (kind.h)
    std::string name;       // the kind with its inputs; an inverted one is "~A"
    std::string shortForm;  // a text for Kq_BoolEquation, as 'explain' prints it (short_form.h)
    size_t numLiterals = 0; // how often shortForm mentions inputs
    bool isMinimal = false; // proved: no expression of & | ^ ~ mentions inputs fewer times
};

struct LutTexts {
    DistinctLuts distinct;
    std::vector<LutText> texts; // one for each distinct table
};

// 'distinctPlaces', unless null, gets the place in the texts of each table.
// Requires: as many names as the tables have inputs, all different.
// Fails: std::bad_alloc, and what Watch() throws.
// Cost: up to a tenth of a millisecond for each distinct function of six inputs.
LutTexts DescribeLuts(const LutArray& luts, const std::vector<std::string>& inputs,
                      uint64_t* distinctPlaces = nullptr, const LutWork& work = LutWork());

} // namespace booleq

#endif
