// EXPAND: each cube of a cover grows to a prime in a way that takes in as many of the other cubes
// as it can (R. Brayton, G. Hachtel, C. McMullen, A. Sangiovanni-Vincentelli, Logic Minimization
// Algorithms for VLSI Synthesis, 1984; R. Rudell, Multiple-valued logic minimization for PLA
// synthesis, 1986).
#ifndef BOOLEQ_MINIMISE_EXPAND_H
#define BOOLEQ_MINIMISE_EXPAND_H

#include "cofactors.h"
#include "obstacles.h"
#include "two_level.h"

namespace booleq {

// Cubes of a list that a growing cube may take in. The list must outlive this; open cubes must not
// change.
class OpenCubes {
  public:
    // All cubes of the list are open, or none.
    OpenCubes(const CubeSpace& space, const CubeList& cubes, bool areOpen);

    const CubeList& Cubes() const { return m_cubes; }
    const CubeColumns& Columns() const { return m_columns; }
    // Bit k says whether cube 64 * block + k is open.
    uint64_t Open(size_t block) const { return m_open[block]; }
    void Close(size_t index) { ClearBit(m_open.data(), index); }
    bool IsOpen(size_t index) const { return GetBit(m_open.data(), index); }

  private:
    const CubeList& m_cubes;
    CubeColumns m_columns;
    std::vector<uint64_t> m_open;
};

// Grows one cube at a time against the off-set of a problem, which must not change during the life
// of this object. If the problem has no off-set, a cube may grow as far as 'on' and 'free' cover
// it, which takes one tautology check for each part.
class Expander {
  public:
    Expander(const TwoLevelProblem& problem, Work& work);

    // Whether the cube meets no row that is off.
    bool IsImplicant(const uint64_t* cube);
    // 'cube' becomes a prime among cubes with only the parts that 'allowed' has or that it had;
    // null allows all. It is steered to take in the open ones of 'others'.
    // Requires: 'cube' is an implicant.
    void Expand(uint64_t* cube, const uint64_t* allowed, const OpenCubes& others);

  private:
    // While a cube grows, m_raised has the parts that it has and m_free those that are not decided;
    // the invariants are those of Obstacles.
    void ExpandByTautology(uint64_t* cube, const CubeList& others);
    void TakeInNearest(uint64_t* cube, const CubeList& others);

    void Settle();
    void CoverOthers(const OpenCubes& others);
    void ListCandidates(const OpenCubes& others);
    size_t FilterCandidates(const CubeList& others);
    size_t CountRaised(const uint64_t* cube) const;
    void RaiseBest(const OpenCubes& others, size_t numFeasible);
    size_t CountAfter(const OpenCubes& others, size_t numFeasible, const uint64_t* with);
    void RaiseMostFrequent(const CubeList& others);
    void RaiseLeastBlocked();
    void Raise(size_t bit);

    const TwoLevelProblem& m_problem;
    const CubeSpace& m_space;
    Work& m_work;
    size_t m_num_words;
    std::vector<uint64_t> m_raised;
    std::vector<uint64_t> m_free;
    std::vector<uint64_t> m_scratch;
    Obstacles m_obstacles;
    const CubeList m_none;
    CubeIndex m_on_index;
    CubeIndex m_free_index;
    Cofactors m_known;                       // on and free; used if there is no off-set
    std::vector<uint32_t> m_candidates;      // feasible ones first
    std::vector<uint64_t> m_feasible;        // in each block of the others
    std::vector<uint32_t> m_feasible_blocks; // blocks that have any
    std::vector<uint32_t> m_counts;
    std::vector<uint32_t> m_lost; // scratch
};

// A cover, with a flag for each cube that is known to be a prime.
struct Cover {
    explicit Cover(size_t numWords) : cubes(numWords) {}
    CubeList cubes;
    std::vector<uint8_t> isPrime;
};

// Drops cubes whose flag is 0.
void KeepInCover(Cover& cover, const std::vector<uint8_t>& isKept);

// Makes all cubes primes and drops those that others then contain. When the work is used up, some
// cubes stay as they are, and OutOfWork is thrown on.
void ExpandCover(const CubeSpace& space, Expander& expander, Cover& cover, Work& work);

// The order that puts first the cubes that have little in common with the others.
std::vector<uint32_t> OrderByWeight(const CubeSpace& space, const CubeList& cubes);

} // namespace booleq

#endif
