#include "column_decision.h"

#include <cassert>

#include "joined_inputs.h"

namespace booleq {

Decision DecideColumns(const Function& left, const Function& right)
{
    Decision decision;
    decision.inputs = left.Inputs();
    JoinInputs(right.Inputs(), decision.inputs);
    assert(decision.inputs.size() <= kMaxFunctionInputs);
    decision.proof = Proof::Rows;
    const Function wideLeft = left.Over(decision.inputs);
    const Function wideRight = right.Over(decision.inputs);
    const uint64_t row = wideLeft.FirstDifference(wideRight);
    if (row == Function::kNoRow) {
        decision.verdict = Verdict::Equal;
        return decision;
    }
    for (size_t input = 0; input < decision.inputs.size(); ++input)
        decision.assignment.push_back(wideLeft.InputAt(row, input));
    decision.left = wideLeft.At(row);
    decision.right = wideRight.At(row);
    decision.verdict = Verdict::Different;
    decision.isFirstRow = true;
    assert(decision.left != decision.right && decision.Row() == row);
    return decision;
}

} // namespace booleq
