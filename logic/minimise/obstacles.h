// What stands in the way of a growing cube: the off cubes that it could still meet. All are checked
// at once, 64 to a word, so a step costs one operation for each block of them and each part that is
// open.
#ifndef BOOLEQ_MINIMISE_OBSTACLES_H
#define BOOLEQ_MINIMISE_OBSTACLES_H

#include "cube_columns.h"
#include "work.h"

namespace booleq {

// Works on two cubes of the caller: 'raised' has the parts that the growing cube has, 'free' those
// that are not decided. Invariants between Start and the next Start:
// 1. raised meets no off cube; raised and free have no part in common.
// 2. After Settle the active cubes are those that raised and free together meet.
// 3. After Settle each free part would bring some active cube nearer.
class Obstacles {
  public:
    // 'off' must not change during the life of this object.
    Obstacles(const CubeSpace& space, const CubeList& off, Work& work);

    // Whether the cube meets an off cube. Does not depend on the growing cube.
    bool IsMet(const uint64_t* cube);

    void Start(const uint64_t* raised, const uint64_t* free);
    // Call it after moving parts from 'free' to 'raised': it decides what follows. Parts that would
    // meet an off cube at once leave 'free'; parts that keep no cube away are raised.
    void Settle(uint64_t* raised, uint64_t* free);

    bool IsNoneActive() const { return m_live.empty(); }
    // Whether raised and 'with' together meet no off cube.
    // Requires: 'with' has only parts of raised and free.
    bool IsFeasible(const uint64_t* free, const uint64_t* with);
    // Removes from 'reach' the parts that would leave 'free' at once if 'with' were raised.
    void ClearLowered(const uint64_t* free, const uint64_t* with, uint64_t* reach);
    // Counts for each free part, by its bit, how many active cubes have it.
    void CountFree(const uint64_t* free, std::vector<uint32_t>& counts);

  private:
    typedef std::vector<uint32_t> Parts;

    void ListOpen(const uint64_t* free, const uint64_t* with);
    bool LowerAndDrop(uint64_t* free);
    void DropOutOfReach(size_t block);
    uint64_t FindNear(const uint64_t* columns, uint64_t common) const;
    void LowerFor(uint64_t near, size_t block, uint64_t* free);
    void RaiseUnblocked(uint64_t* raised, uint64_t* free);

    const CubeSpace& m_space;
    Work& m_work;
    CubeColumns m_off;
    std::vector<uint64_t> m_active; // in each block
    std::vector<uint64_t> m_common; // cubes that have an output of 'raised'
    std::vector<uint32_t> m_live;   // blocks with active cubes, in any order
    std::vector<uint32_t> m_order;  // an order of all blocks, for IsMet
    ColumnsToMeet m_to_meet;        // scratch
    Parts m_inputs;                 // scratch: open inputs, by the bit of the free part
    Parts m_outputs;                // scratch: open outputs
    Parts m_given;                  // scratch: outputs of 'with'
    std::vector<uint64_t> m_seen;   // parts of 'raised' that m_common includes
    Parts m_lowered_inputs;         // not yet checked against all blocks
    size_t m_num_lowered_outputs = 0;
};

} // namespace booleq

#endif
