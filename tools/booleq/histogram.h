// Bars with a label and a number each, as a picture (SVG).
#ifndef BOOLEQ_HISTOGRAM_H
#define BOOLEQ_HISTOGRAM_H

#include <cstdint>
#include <string>
#include <vector>

#include "output.h"

namespace booleq {

struct Bar {
    std::string label;
    uint64_t number;
};

struct Histogram {
    std::string title;
    std::vector<Bar> bars;
};

// One below the other. The longest bar of each takes all the room there is.
void PutHistograms(const std::vector<Histogram>& histograms, Output& output);

} // namespace booleq

#endif
