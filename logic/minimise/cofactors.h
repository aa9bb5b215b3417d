// What cubes look like from within another cube: the lists that the functions of unate.h need.
#ifndef BOOLEQ_MINIMISE_COFACTORS_H
#define BOOLEQ_MINIMISE_COFACTORS_H

#include "cube_columns.h"
#include "work.h"

namespace booleq {

// Appends the cofactor of 'cube' with respect to 'by', which it meets: inputs that 'by' fixes
// become open, the others stay, and so do the outputs that both have.
void AppendCofactor(const CubeSpace& space, const uint64_t* cube, const uint64_t* by,
                    CubeList& target);

// Appends the inputs of each cube that has the output to 'target'; bits that belong to no input are
// 1.
void AppendOfOutput(const CubeSpace& space, const CubeList& cubes, size_t output, CubeList& target);

// Two lists of cubes as seen from within one cube after another.
class Cofactors {
  public:
    Cofactors(const CubeSpace& space, CubeIndex& first, CubeIndex& second, Work& work);

    // Selects 'cube', and leaves out cube 'left' of the first list (SIZE_MAX for none).
    void Take(const uint64_t* cube, size_t left);
    // The cofactors that have the output, as unate.h needs them. The caller may use them as scratch
    // space until the next call.
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

// Whether the two lists together cover 'cube'. For one question; Cofactors is for many.
bool IsCovered(const CubeSpace& space, const uint64_t* cube, const CubeList& first,
               const CubeList& second, Work& work);

} // namespace booleq

#endif
