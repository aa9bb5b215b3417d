// Init values of a design, each different one kept once.
#ifndef BOOLEQ_DESIGN_INIT_STORE_H
#define BOOLEQ_DESIGN_INIT_STORE_H

#include <vector>

#include "design.h"

namespace booleq {

// Invariant: m_slots has a power of two of elements, at most three quarters used; one is 0 or the
// number of an init value plus one.
class InitStore {
  public:
    explicit InitStore(Design& design);

    // 'unknown' may be null: no unknown bits.  Throws ReadFault above 2^32 words.
    // Cost: in step with the words.
    InitId Add(unsigned int numInputs, const uint64_t* words, const uint64_t* unknown);

  private:
    void Grow();
    bool IsSame(InitId init, unsigned int numInputs, const uint64_t* words,
                const uint64_t* unknown) const;

    Design& m_design;
    std::vector<uint32_t> m_slots;
};

} // namespace booleq

#endif
