// What stands in the way of a cube that grows: the off cubes that it could still come to meet. All
// are asked at once, 64 to a word, so that a step costs an operation for each block of them and
// each part that is open.
#ifndef BOOLEQ_MINIMISE_OBSTACLES_H
#define BOOLEQ_MINIMISE_OBSTACLES_H

#include "cube_columns.h"
#include "work.h"

namespace booleq {

// Beside the two cubes of whoever grows: 'raised', which has the parts that the cube has, and
// 'free', which has those that are not decided. Invariants between Start and the next Start:
// 1. raised meets no off cube; raised and free have no part in common.
// 2. The active cubes are those that raised and free together meet, when Settle is done.
// 3. Then each free part is one without which an active cube stays further away.
class Obstacles {
  public:
    // 'off' must stay as it is as long as this lives.
    Obstacles(const CubeSpace& space, const CubeList& off, Work& work);

    // Whether the cube meets an off cube. Asks nothing of what grows.
    bool IsMet(const uint64_t* cube);

    void Start(const uint64_t* raised, const uint64_t* free);
    // To be called after parts have moved from 'free' to 'raised': decides what follows. Parts that
    // would meet an off cube at once leave 'free', parts that keep none away are raised.
    void Settle(uint64_t* raised, uint64_t* free);

    bool IsNoneActive() const { return m_live.empty(); }
    // Whether raised and 'with' together meet no off cube.
    // Requires: 'with' has only parts of the two.
    bool IsFeasible(const uint64_t* free, const uint64_t* with);
    // Takes from 'reach' the parts that would leave 'free' at once if 'with' were raised.
    void ClearLowered(const uint64_t* free, const uint64_t* with, uint64_t* reach);
    // For each free part how many active cubes have it, by its bit.
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
    std::vector<uint64_t> m_active; // of each block
    std::vector<uint64_t> m_common; // the cubes that have an output of 'raised'
    std::vector<uint32_t> m_live;   // blocks with active cubes, in no order
    std::vector<uint32_t> m_order;  // of all blocks, for IsMet
    ColumnsToMeet m_to_meet;        // scratch
    Parts m_inputs;                 // scratch: open ones, by the bit of the free part
    Parts m_outputs;                // scratch: open ones
    Parts m_given;                  // scratch: outputs of 'with'
    std::vector<uint64_t> m_seen;   // parts of 'raised' that m_common knows of
    Parts m_lowered_inputs;         // not yet asked of all blocks
    size_t m_num_lowered_outputs = 0;
};

} // namespace booleq

#endif
