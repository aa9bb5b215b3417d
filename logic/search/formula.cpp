#include "formula.h"

#include <algorithm>
#include <utility>

namespace booleq {

namespace {

// A formula and its inversion, each with inversions placed so that they are fewest.
struct Settled {
    Formula formula[2];
    size_t numInversions[2];
};

Operator Dual(Operator op)
{
    return op == Operator::And ? Operator::Or : Operator::And;
}

Formula Plain(Operator op, std::vector<Formula> operands)
{
    Formula formula;
    formula.op = op;
    formula.operands = std::move(operands);
    return formula;
}

Settled Settle(const Formula& formula);

// AND of the operands is the inversion of the OR of their inversions, and the other way round.
Settled SettleProduct(Operator op, const std::vector<Settled>& operands)
{
    std::vector<Formula> sides[2];
    size_t numInversions[2] = {0, 0};
    for (const Settled& operand : operands) {
        for (const int side : {0, 1}) {
            sides[side].push_back(operand.formula[side]);
            numInversions[side] += operand.numInversions[side];
        }
    }
    Settled settled;
    for (const int side : {0, 1}) {
        // Without an inversion of its own the result has the operands of the same side.
        const bool isInverted = numInversions[1 - side] + 1 < numInversions[side];
        const int used = isInverted ? 1 - side : side;
        const Formula inner = Plain(used == 0 ? op : Dual(op), sides[used]);
        settled.formula[side] = isInverted ? Plain(Operator::Not, {inner}) : inner;
        settled.numInversions[side] = numInversions[used] + (isInverted ? 1 : 0);
    }
    return settled;
}

Settled SettleSum(const std::vector<Settled>& operands)
{
    std::vector<Formula> chosen;
    size_t numInversions = 0;
    size_t numFlips = 0;
    for (const Settled& operand : operands) {
        const int side = operand.numInversions[1] < operand.numInversions[0] ? 1 : 0;
        chosen.push_back(operand.formula[side]);
        numInversions += operand.numInversions[side];
        numFlips += static_cast<size_t>(side);
    }
    const size_t wantedSide = numFlips % 2; // the side that needs no inversion of its own
    Settled settled;
    settled.formula[wantedSide] = Plain(Operator::Xor, chosen);
    settled.numInversions[wantedSide] = numInversions;
    settled.formula[1 - wantedSide] = Plain(Operator::Not, {Plain(Operator::Xor, chosen)});
    settled.numInversions[1 - wantedSide] = numInversions + 1;
    return settled;
}

Settled Settle(const Formula& formula)
{
    if (formula.op == Operator::Not) {
        Settled settled = Settle(formula.operands[0]);
        std::swap(settled.formula[0], settled.formula[1]);
        std::swap(settled.numInversions[0], settled.numInversions[1]);
        return settled;
    }
    if (formula.operands.empty())
        return {{formula, MakeNot(formula)}, {0, formula.op == Operator::Input ? 1u : 0u}};
    std::vector<Settled> operands;
    for (const Formula& operand : formula.operands)
        operands.push_back(Settle(operand));
    return formula.op == Operator::Xor ? SettleSum(operands) : SettleProduct(formula.op, operands);
}

uint32_t FirstInput(const Formula& formula)
{
    uint32_t first = formula.op == Operator::Input ? formula.input : UINT32_MAX;
    for (const Formula& operand : formula.operands)
        first = std::min(first, FirstInput(operand));
    return first;
}

Operator Negated(Operator op)
{
    return op == Operator::And ? Operator::Nand
                               : (op == Operator::Or ? Operator::Nor : Operator::Nxor);
}

uint32_t Append(const Formula& formula, Expression& expression)
{
    if (formula.op == Operator::Input)
        return AddInput(expression, formula.input);
    if (formula.operands.empty())
        return AddConstant(expression, formula.op == Operator::One);
    Operator last = formula.op;
    const Formula* inner = &formula;
    if (formula.op == Operator::Not) {
        inner = &formula.operands[0];
        // Of two operands the operator itself is negated.
        if (inner->operands.size() != 2)
            return AddNot(expression, Append(*inner, expression));
        last = Negated(inner->op);
    }
    std::vector<const Formula*> operands;
    for (const Formula& operand : inner->operands)
        operands.push_back(&operand);
    std::stable_sort(operands.begin(), operands.end(),
                     [](const Formula* left, const Formula* right) {
                         return FirstInput(*left) < FirstInput(*right);
                     });
    uint32_t node = Append(*operands[0], expression);
    for (size_t operand = 1; operand < operands.size(); ++operand) {
        const uint32_t right = Append(*operands[operand], expression);
        const bool isLast = operand + 1 == operands.size();
        node = AddBinary(expression, isLast ? last : inner->op, node, right);
    }
    return node;
}

} // namespace

Formula MakeConstant(bool value)
{
    Formula formula;
    formula.op = value ? Operator::One : Operator::Zero;
    return formula;
}

Formula MakeInput(uint32_t input)
{
    Formula formula;
    formula.op = Operator::Input;
    formula.input = input;
    return formula;
}

Formula MakeNot(const Formula& operand)
{
    if (operand.op == Operator::Zero || operand.op == Operator::One)
        return MakeConstant(operand.op == Operator::Zero);
    if (operand.op == Operator::Not)
        return operand.operands[0];
    return Plain(Operator::Not, {operand});
}

Formula Join(Operator op, const Formula& left, const Formula& right)
{
    std::vector<Formula> operands;
    for (const Formula* side : {&left, &right}) {
        if (side->op == op)
            operands.insert(operands.end(), side->operands.begin(), side->operands.end());
        else
            operands.push_back(*side);
    }
    return Plain(op, std::move(operands));
}

size_t CountLiterals(const Formula& formula)
{
    size_t count = formula.op == Operator::Input ? 1 : 0;
    for (const Formula& operand : formula.operands)
        count += CountLiterals(operand);
    return count;
}

Expression ToExpression(const Formula& formula, const std::vector<std::string>& names)
{
    Expression expression;
    expression.names = names;
    Append(Settle(formula).formula[0], expression);
    return expression;
}

} // namespace booleq
