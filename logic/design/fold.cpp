#include "fold.h"

#include <algorithm>
#include <cassert>

namespace booleq {

namespace {

// The rows of 'word' where bit 'bit' of the row's number is 'value', packed: one input less.
uint64_t HalfWord(uint64_t word, unsigned int bit, bool value)
{
    // Keeps the rows wanted, then closes the gaps, which double at each step.
    static constexpr uint64_t kPacked[6] = {0x5555555555555555, 0x3333333333333333,
                                            0x0f0f0f0f0f0f0f0f, 0x00ff00ff00ff00ff,
                                            0x0000ffff0000ffff, 0x00000000ffffffff};
    if (value)
        word >>= 1u << bit;
    word &= kPacked[bit];
    for (unsigned int gap = bit; gap < 5; ++gap)
        word = (word | word >> (1u << gap)) & kPacked[gap + 1];
    return word;
}

// The word over one input less: where inputs of bits 'low' and 'high' are the same net.
uint64_t MergedWord(uint64_t word, unsigned int low, unsigned int high)
{
    const uint64_t both = BitPattern(low);
    const uint64_t zero = HalfWord(word, high, false);
    const uint64_t one = HalfWord(word, high, true);
    return (zero & ~both) | (one & both);
}

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

// Works on pins, the least significant first, and turns the nets round at the end.
FoldedWord FoldSmallTable(const Design& design, const DesignTable& table)
{
    const unsigned int numInputs = design.NumInputs(table);
    assert(numInputs <= 6);
    const NetId* inputs = design.Inputs(table);
    uint64_t word = *design.Words(design.inits[table.init]);
    NetId nets[6];
    unsigned int numNets = 0;
    for (unsigned int pin = 0; pin < numInputs; ++pin) {
        const NetId net = inputs[pin];
        if (net <= kNetOne) {
            word = HalfWord(word, numNets, net == kNetOne);
            continue;
        }
        const unsigned int place = IsWire(net) ? PlaceOf(nets, numNets, net) : numNets;
        if (place < numNets)
            word = MergedWord(word, place, numNets);
        else
            nets[numNets++] = net;
    }
    FoldedWord folded;
    folded.word = word & RowMask(numNets);
    folded.numInputs = numNets;
    std::reverse_copy(nets, nets + numNets, folded.nets);
    assert((folded.word & ~RowMask(folded.numInputs)) == 0);
    return folded;
}

FoldedRows FoldTable(const Design& design, const DesignTable& table)
{
    const unsigned int numInputs = design.NumInputs(table);
    const NetId* inputs = design.Inputs(table);
    FoldedRows folded;
    folded.rows = TableRows(design, design.inits[table.init]);
    std::vector<unsigned int> kept; // inputs of the rows, descending: from the first pin on
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
