// Tautology and complement of single-output covers by the unate recursive paradigm (R. Brayton, G.
// Hachtel, C. McMullen, A. Sangiovanni-Vincentelli, Logic Minimization Algorithms for VLSI
// Synthesis, 1984). A cover is a list of input cubes: NumInputWords() words each, in which bits
// that belong to no input are 1. Recursion is at most as deep as there are inputs.
#ifndef BOOLEQ_MINIMISE_UNATE_H
#define BOOLEQ_MINIMISE_UNATE_H

#include "cube.h"
#include "work.h"

namespace booleq {

// Whether the cubes cover all rows. 'cubes' is scratch space afterwards.
bool IsTautology(const CubeSpace& space, CubeList& cubes, Work& work);

// A cover of the rows that no cube covers; not always by primes. 'cubes' is scratch space
// afterwards.
// Fails: false if there are more than 'maxCubes', or finding them takes too long for so many.
bool ComplementInputs(const CubeSpace& space, CubeList& cubes, size_t maxCubes, Work& work,
                      CubeList& result);

// Adds to 'found' the parts of input cubes that occur in rows that no cube covers. Parts already in
// 'found' are not searched for, so the caller puts in those of no interest. 'cubes' is scratch
// space afterwards.
void AddUncovered(const CubeSpace& space, CubeList& cubes, Work& work, uint64_t* found);

// Rows of outputs of a cube that no cube of a list covers, one after another while the list grows.
class UncoveredRows {
  public:
    UncoveredRows(const CubeSpace& space, const uint64_t* cube, const CubeList& cubes, Work& work);

    // A row has all inputs fixed and one output. Cover it before asking for the next one.
    // Fails: false if there is none; 'row' is unspecified then.
    bool Next(uint64_t* row);
    // Adds a cube to the list.
    void Cover(const uint64_t* cube);

  private:
    void ListOutput();

    const CubeSpace& m_space;
    Work& m_work;
    std::vector<uint64_t> m_cube;
    CubeList m_meeting;   // cofactors of the list
    CubeList m_of_output; // cofactors with the output
    size_t m_output = 0;  // the outputs before it are covered
};

// Cubes with the same inputs become one with the outputs of all, in the order of CompareInputs.
void UniteOutputs(const CubeSpace& space, CubeList& cubes);

// For each output the rows in no cube of the two lists; cubes with the same inputs are united.
CubeList Complement(const CubeSpace& space, const CubeList& first, const CubeList& second,
                    Work& work);

// The same, unless some output has more than 'maxCubes'.
// Fails: false; 'result' is then empty.  Requires: 'result' is neither of the lists.
bool FindComplement(const CubeSpace& space, const CubeList& first, const CubeList& second,
                    size_t maxCubes, Work& work, CubeList& result);

} // namespace booleq

#endif
