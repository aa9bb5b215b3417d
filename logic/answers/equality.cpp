#include "equality.h"

#include "column_decision.h"
#include "function.h"
#include "joined_inputs.h"
#include "text.h"

namespace booleq {

namespace {

bool IsInitValue(const Kq_BoolEquation& equation)
{
    return equation.IsHexInitValue() || equation.IsBinaryInitValue();
}

size_t NumInputsTogether(const Kq_BoolEquation& left, const Kq_BoolEquation& right)
{
    std::vector<std::string> inputs = InputNames(left);
    JoinInputs(InputNames(right), inputs);
    return inputs.size();
}

} // namespace

Decision DecideEquations(const Kq_BoolEquation& left, const Kq_BoolEquation& right,
                         const Limits& limits)
{
    // An init value has its rows ready, and as an expression it may be huge.
    Function leftColumn;
    Function rightColumn;
    if ((IsInitValue(left) || IsInitValue(right)) &&
        NumInputsTogether(left, right) <= kMaxFunctionInputs && FunctionOf(left, leftColumn) &&
        FunctionOf(right, rightColumn))
        return DecideColumns(leftColumn, rightColumn);
    return DecideEqual(ToExpression(left), ToExpression(right), limits);
}

Decision DecideValue(const Kq_BoolEquation& equation, bool value, const Limits& limits)
{
    Function column;
    if (IsInitValue(equation) && FunctionOf(equation, column))
        return DecideColumns(column, {{}, ConstantRows(0, value)});
    return DecideConstant(ToExpression(equation), value, limits);
}

} // namespace booleq
