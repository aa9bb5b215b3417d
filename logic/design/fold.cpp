#include "fold.h"

#include <algorithm>
#include <cassert>

namespace booleq {

namespace {

bool IsWire(NetId net)
{
    return net >= kNumFixedNets;
}

// The place of the net before 'end', or 'end'.
template <class Nets>
unsigned int PlaceOf(const Nets& nets, unsigned int end, NetId net)
{
    unsigned int place = 0;
    while (place < end && nets[place] != net)
        ++place;
    return place;
}

} // namespace

Rows TableRows(const Design& design, const InitValue& init)
{
    const uint64_t* words = design.Words(init);
    return Rows(init.numInputs, std::vector<uint64_t>(words, words + NumWords(init.numInputs)));
}

FoldedRows FoldTable(const Design& design, const DesignTable& table)
{
    const unsigned int numInputs = design.NumInputs(table);
    const NetId* inputs = design.Inputs(table);
    FoldedRows folded;
    folded.rows = TableRows(design, design.inits[table.init]);
    std::vector<unsigned int> kept; // inputs of the rows, descending: the order of the pins
    for (unsigned int pin = 0; pin < numInputs; ++pin) {
        const unsigned int input = numInputs - 1 - pin;
        const NetId net = inputs[pin];
        if (net <= kNetOne) {
            folded.rows = Cofactor(folded.rows, input, net == kNetOne);
            continue;
        }
        const auto end = static_cast<unsigned int>(folded.nets.size());
        const unsigned int place = IsWire(net) ? PlaceOf(folded.nets, end, net) : end;
        if (place < end) {
            const Rows first = InputRows(numInputs, kept[place]);
            folded.rows = (Cofactor(folded.rows, input, true) & first) |
                          AndNot(Cofactor(folded.rows, input, false), first);
            continue;
        }
        kept.push_back(input);
        folded.nets.push_back(net);
    }
    std::reverse(kept.begin(), kept.end());
    std::reverse(folded.nets.begin(), folded.nets.end());
    folded.rows = Restrict(folded.rows, kept);
    assert(folded.rows.NumInputs() == folded.nets.size());
    return folded;
}

} // namespace booleq
