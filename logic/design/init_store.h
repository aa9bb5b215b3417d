// The init values of a design; each distinct one is kept once.
#ifndef BOOLEQ_DESIGN_INIT_STORE_H
#define BOOLEQ_DESIGN_INIT_STORE_H

#include <cstdint>
#include <vector>

#include "design.h"

namespace booleq {

// Limit for all distinct init values of a design together. A line of a few bytes can ask for a
// table of 8 KB, so the size of the file is not a bound: a file of 100 MB could ask for 40 GB. The
// limit allows 32 million distinct tables of six inputs, about as many as the largest file has room
// for, or 32,768 of sixteen.
constexpr uint64_t kMaxInitBytes = uint64_t(1) << 28;

// Invariant: the number of slots is a power of two, and at most three quarters are used. A slot is
// 0 or the number of an init value plus one.
class InitStore {
  public:
    explicit InitStore(Design& design);

    // 'unknown' may be null: no unknown bits.
    // Fails: false if all of them together would take more than kMaxInitBytes.
    // Cost: linear in the words.
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
