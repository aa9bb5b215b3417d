// What cubes look like from within another one: the lists that the functions of unate.h ask for.
#ifndef BOOLEQ_MINIMISE_COFACTORS_H
#define BOOLEQ_MINIMISE_COFACTORS_H

#include "cube_columns.h"
#include "work.h"

namespace booleq {

// Appends the cofactor of 'cube' with respect to 'by', which it meets: its inputs as far as 'by'
// leaves them open, all others admitted, and the outputs that both have.
void AppendCofactor(const CubeSpace& space, const uint64_t* cube, const uint64_t* by,
                    CubeList& target);

// Appends the inputs of each cube that has the output to 'target', bits that belong to no input
// all 1.
void AppendOfOutput(const CubeSpace& space, const CubeList& cubes, size_t output, CubeList& target);

// Two lists of cubes, as seen from within one cube after the other.
class Cofactors {
  public:
    Cofactors(const CubeSpace& space, CubeIndex& first, CubeIndex& second, Work& work);

    // From now on 'cube' is the one; without cube 'left' of the first list (SIZE_MAX for none).
    void Take(const uint64_t* cube, size_t left);
    // The cofactors that have the output, as unate.h wants them; scratch space of whoever asks,
    // until the next question.
    CubeList& OfOutput(size_t output);
    // Whether the two lists together cover the cube.
    bool Cover(const uint64_t* cube, size_t left);

  private:
    const CubeSpace& m_space;
    CubeIndex& m_first;
    CubeIndex& m_second;
    Work& m_work;
    std::vector<uint32_t> m_found;
    CubeList m_meeting;
    CubeList m_of_output;
};

// Whether the two lists together cover 'cube': for one question; many are for Cofactors.
bool IsCovered(const CubeSpace& space, const uint64_t* cube, const CubeList& first,
               const CubeList& second, Work& work);

} // namespace booleq

#endif
