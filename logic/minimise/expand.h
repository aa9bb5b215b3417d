// EXPAND: each cube of a cover grows to a prime, so that it takes as many of the others with it as
// it can (R. Brayton, G. Hachtel, C. McMullen, A. Sangiovanni-Vincentelli, Logic Minimization
// Algorithms for VLSI Synthesis, 1984; R. Rudell, Multiple-valued logic minimization for PLA
// synthesis, 1986).
#ifndef BOOLEQ_MINIMISE_EXPAND_H
#define BOOLEQ_MINIMISE_EXPAND_H

#include "two_level.h"

namespace booleq {

// Grows one cube at a time against the off-set of a problem, which must stay as it is as long as
// this lives. Where the problem has no off-set, a cube may grow as far as 'on' and 'free' cover it,
// which is one question of tautology for each part.
class Expander {
  public:
    Expander(const TwoLevelProblem& problem, Work& work);

    // Whether the cube meets no row that is off.
    bool IsImplicant(const uint64_t* cube);
    // 'cube' becomes a prime that has only parts that 'allowed' has, or that it had; null allows
    // all. It is steered to take in cubes of 'others' whose flag in 'isOpen' is set.
    // Requires: an implicant.
    void Expand(uint64_t* cube, const uint64_t* allowed, const CubeList& others,
                const std::vector<uint8_t>& isOpen);

  private:
    // Invariants while a cube grows:
    // 1. m_raised meets no off cube; m_free has parts that are not decided, none of m_raised's.
    // 2. m_active has the off cubes that m_raised and m_free together meet.
    // 3. m_blocked has the free parts that an active cube needs to come nearer; when Settle is done
    //    these are all the free parts.
    void ExpandByTautology(uint64_t* cube, const CubeList& others);
    void TakeInNearest(uint64_t* cube, const CubeList& others);

    void Settle();
    bool LowerAndDrop();
    template <size_t kNumWords>
    bool LowerAndDropIn();
    bool IsFeasible(const uint64_t* with);
    void CoverOthers(const CubeList& others);
    size_t FilterCandidates(const CubeList& others);
    void RaiseBest(const CubeList& others, size_t numFeasible);
    size_t CountAfter(const CubeList& others, size_t numFeasible, const uint64_t* with);
    void RaiseMostFrequent(const CubeList& others);
    void RaiseLeastBlocked();
    void Raise(size_t bit);

    const TwoLevelProblem& m_problem;
    const CubeSpace& m_space;
    const CubeList& m_off;
    Work& m_work;
    size_t m_num_words;
    std::vector<uint64_t> m_raised;
    std::vector<uint64_t> m_free;
    std::vector<uint64_t> m_blocked;
    std::vector<uint64_t> m_scratch;
    std::vector<uint32_t> m_order; // of the off cubes, for IsImplicant
    std::vector<uint32_t> m_active;
    std::vector<uint32_t> m_candidates; // feasible ones first
    std::vector<uint32_t> m_counts;
};

// Whether a cube is known to be a prime, beside each cube of a cover.
struct Cover {
    explicit Cover(size_t numWords) : cubes(numWords) {}
    CubeList cubes;
    std::vector<uint8_t> isPrime;
};

// All cubes become primes; those that others then contain go. 'allowed' as above.
void ExpandCover(const CubeSpace& space, Expander& expander, const uint64_t* allowed, Cover& cover,
                 Work& work);

// The order that puts cubes first which have little in common with the others.
std::vector<uint32_t> OrderByWeight(const CubeSpace& space, const CubeList& cubes);

} // namespace booleq

#endif
