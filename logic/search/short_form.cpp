#include "short_form.h"

#include <algorithm>
#include <map>

#include "cover.h"
#include "formula.h"
#include "rows.h"
#include "shortest.h"
#include "watch.h"

namespace booleq {

namespace {

constexpr size_t kMaxProducts = 1000;         // more are no expression for people
constexpr unsigned int kMaxSplitInputs = 10;  // two sets of these are tried each way
constexpr unsigned int kMaxExpandInputs = 10; // expansions by each of these are compared

// Some input of 'inputs' being 1 or 0 makes it 1 (isSome), or both do.
Rows Quantify(const Rows& function, const std::vector<unsigned int>& inputs, bool isSome)
{
    Rows result(function);
    for (const unsigned int input : inputs) {
        const Rows low = Cofactor(result, input, false);
        const Rows high = Cofactor(result, input, true);
        result = isSome ? (low | high) : (low & high);
    }
    return result;
}

Rows FixAll(const Rows& function, const std::vector<unsigned int>& inputs)
{
    Rows result(function);
    for (const unsigned int input : inputs)
        result = Cofactor(result, input, false);
    return result;
}

// Takes out the literal that most products share, again and again.
// The depth is at most the number of products and literals.
Formula Factor(const std::vector<Cube>& cubes, unsigned int numInputs)
{
    if (cubes.empty())
        return MakeConstant(false);
    size_t best = 0;
    Cube literal = {0, 0};
    for (unsigned int input = 0; input < numInputs; ++input) {
        for (const uint32_t value : {0u, 1u}) {
            const uint32_t bit = uint32_t(1) << input;
            const auto count = static_cast<size_t>(
                std::count_if(cubes.begin(), cubes.end(), [=](const Cube& cube) {
                    return (cube.used & bit) != 0 && (cube.values & bit) == value << input;
                }));
            if (count > best) {
                best = count;
                literal = {bit, value << input};
            }
        }
    }
    if (best == 0)
        return MakeConstant(true); // a product without literals
    std::vector<Cube> with;
    std::vector<Cube> without;
    for (const Cube& cube : cubes) {
        if ((cube.used & literal.used) != 0 && (cube.values & literal.used) == literal.values)
            with.push_back({cube.used & ~literal.used, cube.values & ~literal.used});
        else
            without.push_back(cube);
    }
    const auto input = static_cast<uint32_t>(__builtin_ctz(literal.used));
    Formula formula = literal.values != 0 ? MakeInput(input) : MakeNot(MakeInput(input));
    const Formula rest = Factor(with, numInputs);
    if (rest.op != Operator::One)
        formula = Join(Operator::And, formula, rest);
    return without.empty() ? formula : Join(Operator::Or, formula, Factor(without, numInputs));
}

class Search {
  public:
    explicit Search(unsigned int numInputs) : m_num_inputs(numInputs) {}

    // False when a cover is too long. The depth is at most the number of inputs.
    bool Find(const Rows& function, Formula& formula)
    {
        const std::vector<unsigned int> support = Support(function);
        if (support.size() <= kMaxShortestInputs) {
            formula = FindShortest(function);
            return true;
        }
        const auto known = m_known.find(function);
        if (known != m_known.end()) {
            formula = known->second;
            return true;
        }
        if (!FindByInput(function, support, formula) && !FindSplit(function, support, formula) &&
            !FindBest(function, support, formula))
            return false;
        m_known.emplace(function, formula);
        return true;
    }

  private:
    // An AND, OR or exclusive OR of one input and the rest.
    bool FindByInput(const Rows& function, const std::vector<unsigned int>& support,
                     Formula& formula)
    {
        for (const unsigned int input : support) {
            const Rows low = Cofactor(function, input, false);
            const Rows high = Cofactor(function, input, true);
            const Formula plain = MakeInput(input);
            Formula rest;
            if (IsZero(low))
                return Find(high, rest) && Set(formula, Join(Operator::And, plain, rest));
            if (IsZero(high))
                return Find(low, rest) && Set(formula, Join(Operator::And, MakeNot(plain), rest));
            if (IsOne(low))
                return Find(high, rest) && Set(formula, Join(Operator::Or, MakeNot(plain), rest));
            if (IsOne(high))
                return Find(low, rest) && Set(formula, Join(Operator::Or, plain, rest));
            if (low == ~high)
                return Find(low, rest) && Set(formula, Join(Operator::Xor, plain, rest));
        }
        return false;
    }

    // Two functions without a common input. The first input is always on the first side.
    bool FindSplit(const Rows& function, const std::vector<unsigned int>& support, Formula& formula)
    {
        if (support.size() > kMaxSplitInputs)
            return false;
        const uint32_t numSets = uint32_t(1) << (support.size() - 1);
        for (uint32_t set = 1; set < numSets; ++set) {
            Watch();
            std::vector<unsigned int> sides[2];
            sides[0].push_back(support[0]);
            for (size_t place = 1; place < support.size(); ++place)
                sides[set >> (place - 1) & 1u].push_back(support[place]);
            if (Split(function, sides[0], sides[1], formula))
                return true;
        }
        return false;
    }

    bool Split(const Rows& function, const std::vector<unsigned int>& first,
               const std::vector<unsigned int>& second, Formula& formula)
    {
        const Rows product[2] = {Quantify(function, second, true), Quantify(function, first, true)};
        if ((product[0] & product[1]) == function)
            return JoinParts(Operator::And, product[0], product[1], formula);
        const Rows sum[2] = {Quantify(function, second, false), Quantify(function, first, false)};
        if ((sum[0] | sum[1]) == function)
            return JoinParts(Operator::Or, sum[0], sum[1], formula);
        const Rows left = FixAll(function, second);
        const Rows right = function.At(0) ? ~FixAll(function, first) : FixAll(function, first);
        if ((left ^ right) == function)
            return JoinParts(Operator::Xor, left, right, formula);
        return false;
    }

    bool JoinParts(Operator op, const Rows& left, const Rows& right, Formula& formula)
    {
        Formula leftFormula;
        Formula rightFormula;
        return Find(left, leftFormula) && Find(right, rightFormula) &&
               Set(formula, Join(op, leftFormula, rightFormula));
    }

    // The shortest of the factored covers and an expansion.
    bool FindBest(const Rows& function, const std::vector<unsigned int>& support, Formula& formula)
    {
        bool isFound = false;
        for (const bool isInverted : {false, true}) {
            const std::vector<Cube> cover = FindCover(isInverted ? ~function : function);
            if (cover.size() > kMaxProducts)
                continue;
            const Formula factored = Factor(cover, m_num_inputs);
            Keep(isInverted ? MakeNot(factored) : factored, isFound, formula);
        }
        if (support.size() <= kMaxExpandInputs)
            Expand(function, support, isFound, formula);
        return isFound;
    }

    // By the input whose parts have the shortest covers: as a multiplexer, or as one part that the
    // input turns into the other.
    void Expand(const Rows& function, const std::vector<unsigned int>& support, bool& isFound,
                Formula& formula)
    {
        size_t leastLiterals = SIZE_MAX;
        unsigned int best = 0;
        int bestKind = 0;
        for (const unsigned int input : support) {
            const Rows low = Cofactor(function, input, false);
            const Rows high = Cofactor(function, input, true);
            const size_t lowLiterals = CountLiterals(FindCover(low));
            const size_t highLiterals = CountLiterals(FindCover(high));
            const size_t changeLiterals = CountLiterals(FindCover(low ^ high));
            const size_t counts[3] = {lowLiterals + highLiterals + 2,
                                      lowLiterals + changeLiterals + 1,
                                      highLiterals + changeLiterals + 1};
            for (int kind = 0; kind < 3; ++kind) {
                if (counts[kind] >= leastLiterals)
                    continue;
                leastLiterals = counts[kind];
                best = input;
                bestKind = kind;
            }
        }
        const Rows low = Cofactor(function, best, false);
        const Rows high = Cofactor(function, best, true);
        const Formula plain = MakeInput(best);
        Formula first;
        Formula second;
        if (bestKind == 0) {
            if (Find(high, first) && Find(low, second))
                Keep(Join(Operator::Or, Join(Operator::And, plain, first),
                          Join(Operator::And, MakeNot(plain), second)),
                     isFound, formula);
            return;
        }
        const Formula turn = bestKind == 1 ? plain : MakeNot(plain);
        if (Find(bestKind == 1 ? low : high, first) && Find(low ^ high, second))
            Keep(Join(Operator::Xor, first,
                      second.op == Operator::One ? turn : Join(Operator::And, turn, second)),
                 isFound, formula);
    }

    static bool Set(Formula& formula, const Formula& found)
    {
        formula = found;
        return true;
    }

    static void Keep(const Formula& found, bool& isFound, Formula& formula)
    {
        if (!isFound || CountLiterals(found) < CountLiterals(formula))
            formula = found;
        isFound = true;
    }

    unsigned int m_num_inputs;
    std::map<Rows, Formula> m_known;
};

} // namespace

ShortForm FindShortForm(const Function& function)
{
    ShortForm result;
    const Rows& rows = function.GetRows();
    Formula formula;
    if (!Search(rows.NumInputs()).Find(rows, formula))
        return result;
    result.expression = ToExpression(formula, function.Inputs());
    // What is printed is proved, not what was meant to be written.
    result.isFound = ToFunction(result.expression) == function;
    const size_t numMattering = Support(rows).size();
    result.numLiterals = CountLiterals(formula);
    // Every input that matters must be mentioned, so once each is the least there is.
    result.isMinimal = numMattering <= kMaxShortestInputs || result.numLiterals == numMattering;
    return result;
}

} // namespace booleq
