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

// The least number of inversions that a formula (side 0) and its inversion (side 1) need, and what
// is needed to write either.
typedef std::array<size_t, 2> Sides;
struct Settled {
    const Formula* formula = nullptr; // never a Not
    bool isFlipped = false;           // side 0 is the inversion of that formula
    uint32_t firstInput = UINT32_MAX; // the least that it mentions
    Sides numInversions = {0, 0};
    std::vector<Settled> operands;
};

// Whether a side is written as the inversion of the other: the AND of operands is the inversion of
// the OR of their inversions, and the other way round.
bool IsByInversion(const Sides& sums, size_t side)
{
    return sums[1 - side] + 1 < sums[side];
}

Sides SumInversions(const std::vector<Settled>& operands)
{
    Sides sums = {0, 0};
    for (const Settled& operand : operands)
        for (const size_t side : {0u, 1u})
            sums[side] += operand.numInversions[side];
    return sums;
}

// The side of an exclusive OR's operand that needs fewer inversions.
size_t BetterSide(const Settled& settled)
{
    return settled.numInversions[1] < settled.numInversions[0] ? 1 : 0;
}

// The side of an exclusive OR that needs no inversion of its own.
size_t PlainSide(const std::vector<Settled>& operands)
{
    size_t numFlips = 0;
    for (const Settled& operand : operands)
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
    if (formula.operands.empty()) {
        if (formula.op == Operator::Input) {
            settled.firstInput = formula.input;
            settled.numInversions[1] = 1;
        }
        return settled;
    }
    settled.operands.reserve(formula.operands.size());
    for (const Formula& operand : formula.operands) {
        settled.operands.push_back(Settle(operand));
        settled.firstInput = std::min(settled.firstInput, settled.operands.back().firstInput);
    }
    if (formula.op == Operator::Xor) {
        size_t least = 0;
        for (const Settled& operand : settled.operands)
            least += operand.numInversions[BetterSide(operand)];
        const size_t plainSide = PlainSide(settled.operands);
        settled.numInversions[plainSide] = least;
        settled.numInversions[1 - plainSide] = least + 1;
        return settled;
    }
    const Sides sums = SumInversions(settled.operands);
    for (const size_t side : {0u, 1u})
        settled.numInversions[side] = IsByInversion(sums, side) ? sums[1 - side] + 1 : sums[side];
    return settled;
}

// Operands in the order of their inputs.
std::vector<const Settled*> Sorted(const std::vector<Settled>& operands)
{
    std::vector<const Settled*> sorted;
    sorted.reserve(operands.size());
    for (const Settled& operand : operands)
        sorted.push_back(&operand);
    // Equal ones keep their order: they are elements of one array.
    std::sort(sorted.begin(), sorted.end(), [](const Settled* left, const Settled* right) {
        return left->firstInput != right->firstInput ? left->firstInput < right->firstInput
                                                     : left < right;
    });
    return sorted;
}

Operator Negated(Operator op)
{
    return op == Operator::And ? Operator::Nand
                               : (op == Operator::Or ? Operator::Nor : Operator::Nxor);
}

// Adds the formula, or for side 1 its inversion, with inversions where Settle put them.
uint32_t Append(const Settled& settled, size_t side, Expression& expression)
{
    const size_t own = settled.isFlipped ? 1 - side : side; // the side of the formula pointed to
    const Formula& formula = *settled.formula;
    if (formula.op == Operator::Input) {
        const uint32_t node = AddInput(expression, formula.input);
        return own == 0 ? node : AddNot(expression, node);
    }
    if (settled.operands.empty())
        return AddConstant(expression, (formula.op == Operator::One) == (own == 0));
    const bool isXor = formula.op == Operator::Xor;
    const bool isInverted = isXor ? own != PlainSide(settled.operands)
                                  : IsByInversion(SumInversions(settled.operands), own);
    const size_t used = isInverted ? 1 - own : own; // of the operands, except for exclusive OR
    const Operator op = isXor || used == 0 ? formula.op : Dual(formula.op);
    const std::vector<const Settled*> operands = Sorted(settled.operands);
    // With two operands the operator itself is negated.
    const bool isNegated = isInverted && operands.size() == 2;
    uint32_t node = 0;
    for (size_t place = 0; place < operands.size(); ++place) {
        const Settled& operand = *operands[place];
        const uint32_t right = Append(operand, isXor ? BetterSide(operand) : used, expression);
        node =
            place == 0 ? right : AddBinary(expression, isNegated ? Negated(op) : op, node, right);
    }
    return isInverted && !isNegated ? AddNot(expression, node) : node;
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
    Append(Settle(formula), 0, expression);
    return expression;
}

} // namespace booleq
