#include "formula.h"

#include <algorithm>
#include <array>
#include <iterator>
#include <utility>

namespace booleq {

namespace {

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

Formula Around(Operator op, Formula operand)
{
    std::vector<Formula> operands;
    operands.push_back(std::move(operand));
    return Plain(op, std::move(operands));
}

// How many inversions a formula (side 0) and its inversion (side 1) need, placed so that they are
// fewest; and what is needed to write either.
typedef std::array<size_t, 2> Sides;
struct Settled {
    const Formula* formula = nullptr; // not a Not
    bool isFlipped = false;           // side 0 is that formula's inversion
    Sides numInversions = {0, 0};
    std::vector<Settled> operands;
};

// AND of the operands is the inversion of the OR of their inversions, and the other way round.
// Whether a side is written so.
bool IsByInversion(const Sides& sums, size_t side)
{
    return sums[1 - side] + 1 < sums[side];
}

Sides SumInversions(const std::vector<Settled>& operands)
{
    Sides sums = {0, 0};
    for (const Settled& operand : operands)
        for (const size_t side : {0, 1})
            sums[side] += operand.numInversions[side];
    return sums;
}

// The side of an operand of an exclusive OR that needs fewer.
size_t BetterSide(const Settled& settled)
{
    return settled.numInversions[1] < settled.numInversions[0] ? 1 : 0;
}

// The side of an exclusive OR that needs no inversion of its own.
size_t PlainSide(const Settled& settled)
{
    size_t numFlips = 0;
    for (const Settled& operand : settled.operands)
        numFlips += BetterSide(operand);
    return numFlips % 2;
}

Settled Settle(const Formula& formula)
{
    if (formula.op == Operator::Not) {
        Settled settled = Settle(formula.operands[0]);
        settled.isFlipped = !settled.isFlipped;
        std::swap(settled.numInversions[0], settled.numInversions[1]);
        return settled;
    }
    Settled settled;
    settled.formula = &formula;
    settled.operands.reserve(formula.operands.size());
    for (const Formula& operand : formula.operands)
        settled.operands.push_back(Settle(operand));
    if (formula.op == Operator::Xor) {
        size_t least = 0;
        for (const Settled& operand : settled.operands)
            least += operand.numInversions[BetterSide(operand)];
        const size_t plainSide = PlainSide(settled);
        settled.numInversions[plainSide] = least;
        settled.numInversions[1 - plainSide] = least + 1;
    } else if (settled.operands.empty()) {
        settled.numInversions[1] = formula.op == Operator::Input ? 1 : 0;
    } else {
        const Sides sums = SumInversions(settled.operands);
        for (const size_t side : {0, 1})
            settled.numInversions[side] =
                IsByInversion(sums, side) ? sums[1 - side] + 1 : sums[side];
    }
    return settled;
}

// The formula, or for side 1 its inversion, with the inversions where they were settled.
Formula WriteSide(const Settled& settled, size_t side)
{
    const size_t own = settled.isFlipped ? 1 - side : side; // of the formula that is pointed to
    const Operator op = settled.formula->op;
    if (settled.operands.empty())
        return own == 0 ? *settled.formula : MakeNot(*settled.formula);
    std::vector<Formula> operands;
    operands.reserve(settled.operands.size());
    if (op == Operator::Xor) {
        for (const Settled& operand : settled.operands)
            operands.push_back(WriteSide(operand, BetterSide(operand)));
        Formula inner = Plain(op, std::move(operands));
        return own == PlainSide(settled) ? inner : Around(Operator::Not, std::move(inner));
    }
    const Sides sums = SumInversions(settled.operands);
    const bool isByInversion = IsByInversion(sums, own);
    const size_t used = isByInversion ? 1 - own : own;
    for (const Settled& operand : settled.operands)
        operands.push_back(WriteSide(operand, used));
    Formula inner = Plain(used == 0 ? op : Dual(op), std::move(operands));
    return isByInversion ? Around(Operator::Not, std::move(inner)) : inner;
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

Formula MakeNot(Formula operand)
{
    if (operand.op == Operator::Zero || operand.op == Operator::One)
        return MakeConstant(operand.op == Operator::Zero);
    if (operand.op == Operator::Not) {
        Formula inner = std::move(operand.operands[0]);
        return inner;
    }
    return Around(Operator::Not, std::move(operand));
}

Formula Join(Operator op, Formula left, Formula right)
{
    std::vector<Formula> operands;
    for (Formula* const side : {&left, &right}) {
        if (side->op == op && operands.empty())
            operands = std::move(side->operands);
        else if (side->op == op)
            std::move(side->operands.begin(), side->operands.end(), std::back_inserter(operands));
        else
            operands.push_back(std::move(*side));
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
    Append(WriteSide(Settle(formula), 0), expression);
    return expression;
}

} // namespace booleq
