#include "shortest.h"

#include <cassert>
#include <mutex>
#include <shared_mutex>
#include <utility>

#include "watch.h"

namespace booleq {

namespace {

// The four-input rows of a function, used as its number; a function whose row 0 is 0 also stands
// for its inversion.
typedef uint16_t Column;

constexpr size_t kNumColumns = 65536;

constexpr Column InputColumn(unsigned int input)
{
    return static_cast<Column>(InputWord(kMaxShortestInputs, input, 0) &
                               RowMask(kMaxShortestInputs));
}

Column Normal(Column column)
{
    return static_cast<Column>(column & 1u ? ~column : column);
}

// The weight of a formula: literals first, then exclusive ORs, which are harder to read. Both add
// up over operands, and a formula has fewer exclusive ORs than literals.
constexpr size_t kLiteralWeight = 32;
constexpr size_t kXorWeight = 1;

// How a column was first found, which is with the least weight.
struct Origin {
    Operator op = Operator::Zero; // Zero: not found yet
    Column left = 0;              // as joined, so it may be inverted
    Column right = 0;
};

class ShortestTable {
  public:
    ShortestTable() : m_origins(kNumColumns), m_by_weight(kLiteralWeight)
    {
        m_by_weight.emplace_back();
        for (unsigned int input = 0; input < kMaxShortestInputs; ++input) {
            const Column column = InputColumn(input);
            m_origins[column] = {Operator::Input, column, 0};
            m_by_weight.back().push_back(column);
        }
    }

    bool Has(Column column) const { return m_origins[Normal(column)].op != Operator::Zero; }
    // Requires: the column is not a constant.
    void Add(Column column)
    {
        while (!Has(column))
            AddWeight();
    }
    // The depth is at most the number of literals.  Requires: Has(column).
    Formula Make(Column column) const
    {
        const Column normal = Normal(column);
        const Origin& origin = m_origins[normal];
        Formula formula;
        if (origin.op == Operator::Input) {
            uint32_t input = 0;
            while (InputColumn(input) != normal)
                ++input;
            formula = MakeInput(input);
        } else {
            formula = Join(origin.op, Make(origin.left), Make(origin.right));
        }
        return column == normal ? formula : MakeNot(std::move(formula));
    }

  private:
    // Adds all columns whose least weight is the next one; none if an exception ends it.
    void AddWeight()
    {
        m_by_weight.emplace_back();
        try {
            AddColumns(m_by_weight.size() - 1);
        } catch (...) {
            for (const Column column : m_by_weight.back())
                m_origins[column] = Origin();
            m_by_weight.pop_back();
            throw;
        }
    }

    void AddColumns(size_t weight)
    {
        for (size_t left = kLiteralWeight; left < weight; ++left) {
            AddPairs(left, weight - left, false);
            if (left < weight - kXorWeight)
                AddPairs(left, weight - kXorWeight - left, true);
        }
    }

    void AddPairs(size_t leftWeight, size_t rightWeight, bool isXor)
    {
        if (rightWeight < leftWeight || rightWeight >= m_by_weight.size())
            return;
        // The last list grows, but no operand is in it: operands weigh less.
        for (const Column left : m_by_weight[leftWeight]) {
            Watch();
            for (const Column right : m_by_weight[rightWeight]) {
                const auto notLeft = static_cast<Column>(~left);
                const auto notRight = static_cast<Column>(~right);
                if (isXor) {
                    Add(Operator::Xor, left, right, static_cast<Column>(left ^ right));
                    continue;
                }
                Add(Operator::And, left, right, static_cast<Column>(left & right));
                Add(Operator::And, left, notRight, static_cast<Column>(left & notRight));
                Add(Operator::And, notLeft, right, static_cast<Column>(notLeft & right));
                Add(Operator::Or, left, right, static_cast<Column>(left | right));
            }
        }
    }

    // Row 0 of both operands is 0 unless inverted, and so is that of every result.
    void Add(Operator op, Column left, Column right, Column result)
    {
        Origin& origin = m_origins[result];
        if (result == 0 || origin.op != Operator::Zero)
            return;
        m_by_weight.back().push_back(result);
        origin = {op, left, right};
    }

    std::vector<Origin> m_origins;
    std::vector<std::vector<Column>> m_by_weight;
};

// Replaces the four inputs by those that matter.
void Renumber(Formula& formula, const std::vector<unsigned int>& support)
{
    if (formula.op == Operator::Input)
        formula.input = support[formula.input];
    for (Formula& operand : formula.operands)
        Renumber(operand, support);
}

} // namespace

Formula FindShortest(const Rows& function)
{
    if (IsZero(function) || IsOne(function))
        return MakeConstant(IsOne(function));
    const std::vector<unsigned int> support = Support(function);
    assert(support.size() <= kMaxShortestInputs);
    // The inputs that matter come first, the others after them.
    Rows rows = Restrict(function, support);
    std::vector<unsigned int> order;
    while (rows.NumInputs() < kMaxShortestInputs)
        rows = Widen(rows);
    const auto numIdle = static_cast<unsigned int>(kMaxShortestInputs - support.size());
    for (unsigned int place = 0; place < kMaxShortestInputs; ++place)
        order.push_back((place + numIdle) % kMaxShortestInputs);
    const auto column = static_cast<Column>(PermuteInputs(std::move(rows), order).Words()[0]);
    static std::shared_mutex mutex; // guards the table
    static ShortestTable table;     // grows as far as needed
    std::shared_lock<std::shared_mutex> reading(mutex);
    if (!table.Has(column)) {
        reading.unlock();
        {
            const std::unique_lock<std::shared_mutex> growing(mutex);
            table.Add(column);
        }
        reading.lock();
    }
    Formula formula = table.Make(column);
    reading.unlock();
    Renumber(formula, support);
    return formula;
}

} // namespace booleq
