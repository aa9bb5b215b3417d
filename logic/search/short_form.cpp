#include "short_form.h"

#include <algorithm>
#include <array>
#include <cassert>
#include <map>
#include <utility>

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

// Sets of inputs: bit k is input k.
typedef uint32_t InputSet;

// Some input of 'inputs' being 1 or 0 makes it 1 (isSome), or both do.
Rows Quantify(const Rows& function, InputSet inputs, bool isSome)
{
    Rows result(function);
    for (; inputs != 0; inputs &= inputs - 1) {
        const auto input = static_cast<unsigned int>(__builtin_ctz(inputs));
        const Rows low = Cofactor(result, input, false);
        const Rows high = Cofactor(result, input, true);
        result = isSome ? (low | high) : (low & high);
    }
    return result;
}

Rows FixAll(const Rows& function, InputSet inputs)
{
    Rows result(function);
    for (; inputs != 0; inputs &= inputs - 1)
        result =
            Cofactor(std::move(result), static_cast<unsigned int>(__builtin_ctz(inputs)), false);
    return result;
}

// Brings the products with the literal that most share to the front, and takes it out of them.
// Gives back the end of those; 'begin' when the products have no literals.
Cube* TakeOutLiteral(Cube* begin, Cube* end, Cube& literal)
{
    std::array<std::array<size_t, 2>, kMaxCoverInputs> counts = {};
    for (const Cube* cube = begin; cube != end; ++cube)
        for (uint32_t used = cube->used; used != 0; used &= used - 1) {
            const auto input = static_cast<unsigned int>(__builtin_ctz(used));
            ++counts[input][cube->values >> input & 1u];
        }
    size_t most = 0;
    for (unsigned int input = 0; input < kMaxCoverInputs; ++input) {
        for (const uint32_t value : {0u, 1u}) {
            if (counts[input][value] > most) {
                most = counts[input][value];
                literal = {uint32_t(1) << input, value << input};
            }
        }
    }
    if (most == 0)
        return begin;
    Cube* const rest = std::partition(begin, end, [&](const Cube& cube) {
        return (cube.used & literal.used) != 0 && (cube.values & literal.used) == literal.values;
    });
    for (Cube* cube = begin; cube != rest; ++cube)
        *cube = {cube->used & ~literal.used, cube->values & ~literal.used};
    assert(static_cast<size_t>(rest - begin) == most);
    return rest;
}

// Takes out the literal that most products share, again and again. The products are changed.
// The depth is at most the number of products and literals.
Formula Factor(Cube* begin, Cube* end)
{
    if (begin == end)
        return MakeConstant(false);
    Cube literal = {0, 0};
    Cube* const rest = TakeOutLiteral(begin, end, literal);
    if (rest == begin)
        return MakeConstant(true); // a product without literals
    Formula formula = MakeInput(static_cast<uint32_t>(__builtin_ctz(literal.used)));
    if (literal.values == 0)
        formula = MakeNot(std::move(formula));
    Formula with = Factor(begin, rest);
    if (with.op != Operator::One)
        formula = Join(Operator::And, std::move(formula), std::move(with));
    if (rest == end)
        return formula;
    return Join(Operator::Or, std::move(formula), Factor(rest, end));
}

// CountLiterals(Factor(begin, end)), without the formula.
size_t CountFactored(Cube* begin, Cube* end)
{
    Cube literal = {0, 0};
    Cube* const rest = begin == end ? begin : TakeOutLiteral(begin, end, literal);
    return rest == begin ? 0 : 1 + CountFactored(begin, rest) + CountFactored(rest, end);
}

class Search {
  public:
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
                return Find(high, rest) &&
                       Set(formula, Join(Operator::And, plain, std::move(rest)));
            if (IsZero(high))
                return Find(low, rest) &&
                       Set(formula, Join(Operator::And, MakeNot(plain), std::move(rest)));
            if (IsOne(low))
                return Find(high, rest) &&
                       Set(formula, Join(Operator::Or, MakeNot(plain), std::move(rest)));
            if (IsOne(high))
                return Find(low, rest) && Set(formula, Join(Operator::Or, plain, std::move(rest)));
            if (low == ~high)
                return Find(low, rest) && Set(formula, Join(Operator::Xor, plain, std::move(rest)));
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
            InputSet sides[2] = {InputSet(1) << support[0], 0};
            for (size_t place = 1; place < support.size(); ++place)
                sides[set >> (place - 1) & 1u] |= InputSet(1) << support[place];
            if (Split(function, sides[0], sides[1], formula))
                return true;
        }
        return false;
    }

    bool Split(const Rows& function, InputSet first, InputSet second, Formula& formula)
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
               Set(formula, Join(op, std::move(leftFormula), std::move(rightFormula)));
    }

    // The shortest of the factored covers and an expansion.
    bool FindBest(const Rows& function, const std::vector<unsigned int>& support, Formula& formula)
    {
        size_t leastLiterals = SIZE_MAX;
        std::vector<Cube> best;
        bool isInverted = false;
        for (const bool ofInverse : {false, true}) {
            std::vector<Cube> cover = FindCover(ofInverse ? ~function : function);
            if (cover.size() > kMaxProducts)
                continue;
            std::vector<Cube> changed(cover);
            const size_t numLiterals =
                CountFactored(changed.data(), changed.data() + changed.size());
            if (numLiterals >= leastLiterals)
                continue;
            leastLiterals = numLiterals;
            best = std::move(cover);
            isInverted = ofInverse;
        }
        if (support.size() <= kMaxExpandInputs && Expand(function, support, leastLiterals, formula))
            return true;
        if (leastLiterals == SIZE_MAX)
            return false;
        Formula factored = Factor(best.data(), best.data() + best.size());
        assert(CountLiterals(factored) == leastLiterals);
        return Set(formula, isInverted ? MakeNot(std::move(factored)) : std::move(factored));
    }

    // An expansion by one input: a multiplexer, or one part that the input turns into the other.
    struct Expansion {
        unsigned int input = 0;
        int kind = 0; // 0: a multiplexer; 1, 2: the part where the input is 0, or 1, is turned
    };

    // That whose parts have the shortest covers.
    static Expansion ChooseExpansion(const Rows& function, const std::vector<unsigned int>& support)
    {
        size_t leastLiterals = SIZE_MAX;
        Expansion best;
        for (const unsigned int input : support) {
            const Rows low = Cofactor(function, input, false);
            const Rows high = Cofactor(function, input, true);
            const size_t lowLiterals = CountCoverLiterals(low);
            const size_t highLiterals = CountCoverLiterals(high);
            const size_t changeLiterals = CountCoverLiterals(low ^ high);
            const size_t counts[3] = {lowLiterals + highLiterals + 2,
                                      lowLiterals + changeLiterals + 1,
                                      highLiterals + changeLiterals + 1};
            for (int kind = 0; kind < 3; ++kind) {
                if (counts[kind] >= leastLiterals)
                    continue;
                leastLiterals = counts[kind];
                best = {input, kind};
            }
        }
        return best;
    }

    // True, and 'formula' is set, where an expansion has fewer literals than 'leastLiterals'.
    bool Expand(const Rows& function, const std::vector<unsigned int>& support,
                size_t leastLiterals, Formula& formula)
    {
        const Expansion best = ChooseExpansion(function, support);
        const Rows low = Cofactor(function, best.input, false);
        const Rows high = Cofactor(function, best.input, true);
        const Formula plain = MakeInput(best.input);
        Formula first;
        Formula second;
        if (best.kind == 0) {
            if (!Find(high, first) || !Find(low, second))
                return false;
            first = Join(Operator::Or, Join(Operator::And, plain, std::move(first)),
                         Join(Operator::And, MakeNot(plain), std::move(second)));
        } else {
            if (!Find(best.kind == 1 ? low : high, first) || !Find(low ^ high, second))
                return false;
            Formula turn = best.kind == 1 ? plain : MakeNot(plain);
            if (second.op != Operator::One)
                turn = Join(Operator::And, std::move(turn), std::move(second));
            first = Join(Operator::Xor, std::move(first), std::move(turn));
        }
        return CountLiterals(first) < leastLiterals && Set(formula, std::move(first));
    }

    static bool Set(Formula& formula, Formula found)
    {
        formula = std::move(found);
        return true;
    }

    std::map<Rows, Formula> m_known;
};

} // namespace

ShortForm FindShortForm(const Function& function)
{
    ShortForm result;
    const Rows& rows = function.GetRows();
    Formula formula;
    if (!Search().Find(rows, formula))
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
