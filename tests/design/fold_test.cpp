// Folding, against a model that looks up each row.
#include <random>

#include <gtest/gtest.h>

#include "fold.h"
#include "init_store.h"

namespace {

using namespace booleq;

typedef std::mt19937_64 Random;

// A design of one table with random bits. It has few nets, so that they repeat.
Design MakeDesign(unsigned int numInputs, Random& random)
{
    Design design;
    std::vector<uint64_t> words(NumWords(numInputs));
    for (uint64_t& word : words)
        word = random() & RowMask(numInputs);
    InitStore inits(design);
    DesignTable table;
    EXPECT_TRUE(inits.Add(numInputs, words.data(), nullptr, table.init));
    for (unsigned int pin = 0; pin < numInputs; ++pin)
        design.inputs.push_back(static_cast<NetId>(random() % (kNumFixedNets + 4)));
    design.nets.resize(kNumFixedNets + 4);
    design.tables.push_back(table);
    return design;
}

// The pins' value for a row over the folded inputs, which are 'nets'.
uint64_t PinsOf(const Design& design, const std::vector<NetId>& nets, uint64_t row)
{
    const DesignTable& table = design.tables[0];
    const auto numNets = static_cast<unsigned int>(nets.size());
    const auto valueOf = [&](unsigned int place) { return row >> (numNets - 1 - place) & 1u; };
    uint64_t pins = 0;
    unsigned int numOpen = 0; // open and unknown pins so far, each with its own input
    for (unsigned int pin = 0; pin < design.NumInputs(table); ++pin) {
        const NetId net = design.Inputs(table)[pin];
        uint64_t value = net == kNetOne ? 1 : 0;
        if (net == kNetOpen || net == kNetUnknown) {
            unsigned int seen = 0; // the last input is that of the first pin
            for (unsigned int place = numNets; place-- > 0;)
                if ((nets[place] == kNetOpen || nets[place] == kNetUnknown) && seen++ == numOpen)
                    value = valueOf(place);
            ++numOpen;
        } else if (net >= kNumFixedNets) {
            for (unsigned int place = 0; place < numNets; ++place)
                if (nets[place] == net)
                    value = valueOf(place);
        }
        pins |= value << pin;
    }
    return pins;
}

TEST(Fold, EqualsTheTableRowByRow)
{
    Random random(5);
    for (int repetition = 0; repetition < 4000; ++repetition) {
        const auto numInputs = static_cast<unsigned int>(random() % 9);
        const Design design = MakeDesign(numInputs, random);
        const Rows rows = TableRows(design, design.inits[0]);
        const FoldedRows folded = FoldTable(design, design.tables[0]);
        for (uint64_t row = 0; row < folded.rows.NumRows(); ++row)
            ASSERT_EQ(folded.rows.At(row), rows.At(PinsOf(design, folded.nets, row)));
    }
}

} // namespace
