#include "shortest.h"

#include <array>
#include <memory>

namespace booleq {

namespace {

typedef uint16_t Column; // of four inputs; the one whose row 0 is 0 stands for its inversion too

constexpr size_t kNumColumns = 65536;
constexpr std::array<Column, 4> kInputColumns = {0xff00, 0xf0f0, 0xcccc, 0xaaaa};

Column Normal(Column column)
{
    return static_cast<Column>(column & 1u ? ~column : column);
}

// How a column was found first, which is with the fewest literals.
struct Origin {
    uint8_t numLiterals = 0; // 0: not found yet
    Operator op = Operator::Zero;
    Column left = 0; // as they are joined, so perhaps inverted
    Column right = 0;
};

class ShortestTable {
  public:
    ShortestTable() : m_origins(kNumColumns), m_by_literals(1)
    {
        m_by_literals.emplace_back();
        for (const Column column : kInputColumns) {
            m_origins[column] = {1, Operator::Input, column, 0};
            m_by_literals[1].push_back(column);
        }
    }

    // Requires: not a constant.
    Formula Find(Column column)
    {
        while (m_origins[Normal(column)].numLiterals == 0)
            AddLevel();
        return Make(column);
    }

  private:
    void AddLevel()
    {
        const size_t numLiterals = m_by_literals.size();
        m_by_literals.emplace_back();
        for (size_t numLeft = 1; numLeft <= numLiterals / 2; ++numLeft)
            for (const Column left : m_by_literals[numLeft])
                for (const Column right : m_by_literals[numLiterals - numLeft])
                    AddPair(left, right, numLiterals);
    }

    void AddPair(Column left, Column right, size_t numLiterals)
    {
        const auto notLeft = static_cast<Column>(~left);
        const auto notRight = static_cast<Column>(~right);
        Add(Operator::And, left, right, static_cast<Column>(left & right), numLiterals);
        Add(Operator::And, left, notRight, static_cast<Column>(left & notRight), numLiterals);
        Add(Operator::And, notLeft, right, static_cast<Column>(notLeft & right), numLiterals);
        Add(Operator::Or, left, right, static_cast<Column>(left | right), numLiterals);
        Add(Operator::Xor, left, right, static_cast<Column>(left ^ right), numLiterals);
    }

    // Row 0 of both operands is 0 unless inverted, and so is that of every result.
    void Add(Operator op, Column left, Column right, Column result, size_t numLiterals)
    {
        Origin& origin = m_origins[result];
        if (result == 0 || origin.numLiterals != 0)
            return;
        origin = {static_cast<uint8_t>(numLiterals), op, left, right};
        m_by_literals.back().push_back(result);
    }

    // The depth is at most the number of literals.
    Formula Make(Column column) const
    {
        const Column normal = Normal(column);
        const Origin& origin = m_origins[normal];
        Formula formula;
        if (origin.op == Operator::Input) {
            uint32_t input = 0;
            while (kInputColumns[input] != normal)
                ++input;
            formula = MakeInput(input);
        } else {
            formula = Join(origin.op, Make(origin.left), Make(origin.right));
        }
        return column == normal ? formula : MakeNot(formula);
    }

    std::vector<Origin> m_origins;
    std::vector<std::vector<Column>> m_by_literals;
};

// The inputs of four become those that matter.
void Renumber(Formula& formula, const std::vector<unsigned int>& support)
{
    if (formula.op == Operator::Input)
        formula.input = support[formula.input];
    for (Formula& operand : formula.operands)
        Renumber(operand, support);
}

} // namespace

Formula FindShortest(const Bits& function)
{
    if (function.IsZero() || function.IsOne())
        return MakeConstant(function.IsOne());
    const std::vector<unsigned int> support = function.Support();
    Column column = 0;
    for (unsigned int row = 0; row < 16; ++row) {
        uint64_t ownRow = 0;
        for (size_t place = 0; place < support.size(); ++place)
            if ((row >> (3 - place) & 1u) != 0)
                ownRow |= uint64_t(1) << (function.NumInputs() - 1 - support[place]);
        if (function.At(ownRow))
            column = static_cast<Column>(column | 1u << row);
    }
    static ShortestTable table; // it grows as far as it was asked for
    Formula formula = table.Find(column);
    Renumber(formula, support);
    return formula;
}

} // namespace booleq
