// Init values of a design, each different one kept once.
#ifndef BOOLEQ_DESIGN_INIT_STORE_H
#define BOOLEQ_DESIGN_INIT_STORE_H

#include <cstdint>
#include <vector>

#include "design.h"

namespace booleq {

// Of all different init values of a design. A line of some bytes can ask for a table of 8 KB, so
// the size of a file bounds nothing: a file of 100 MB could ask for 40 GB. This is 32 million
// different tables of six inputs, about as many as the largest file has room for, and 32,768 of
// sixteen.
constexpr uint64_t kMaxInitBytes = uint64_t(1) << 28;

// Invariant: m_slots has a power of two of elements, at most three quarters used; one is 0 or the
// number of an init value plus one.
class InitStore {
  public:
    explicit InitStore(Design& design);

    // 'unknown' may be null: no unknown bits.
    // Fails: false, where all of them would take more than kMaxInitBytes.
    // Cost: in step with the words.
    bool Add(unsigned int numInputs, const uint64_t* words, const uint64_t* unknown, InitId& init);

  private:
    void Grow();
    bool IsSame(InitId init, unsigned int numInputs, const uint64_t* words,
                const uint64_t* unknown) const;

    Design& m_design;
    std::vector<uint32_t> m_slots;
};

} // namespace booleq

#endif
