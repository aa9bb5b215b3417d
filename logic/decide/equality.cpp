#include "equality.h"

#include <algorithm>

namespace booleq {

Equality CompareFunctions(const Function& left, const Function& right)
{
    Equality equality;
    std::vector<std::string>& inputs = equality.inputs;
    inputs = left.Inputs();
    for (const std::string& name : right.Inputs())
        if (std::find(inputs.begin(), inputs.end(), name) == inputs.end())
            inputs.push_back(name);
    if (inputs.size() > kMaxFunctionInputs) {
        equality.fault = std::to_string(inputs.size()) + " inputs together: at most " +
                         std::to_string(kMaxFunctionInputs) + " are compared";
        return equality;
    }
    const Function wideLeft = left.Over(inputs);
    const Function wideRight = right.Over(inputs);
    equality.row = wideLeft.FirstDifference(wideRight);
    if (!equality.IsEqual()) {
        equality.left = wideLeft.At(equality.row);
        equality.right = wideRight.At(equality.row);
    }
    return equality;
}

} // namespace booleq
