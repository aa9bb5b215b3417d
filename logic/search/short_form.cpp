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

constexpr size_t kMaxProducts = 1000;        // longer expressions are not for people
constexpr unsigned int kMaxSplitInputs = 10; // every split of so many inputs into two sets is tried
constexpr unsigned int kMaxExpandInputs = 10; // expansions by each of so many inputs are compared

// Sets of inputs: bit k is input k.
typedef uint32_t InputSet;

// What is left of a function when inputs are removed: Some is 1 if some of their values make it 1,
// All if all values do, and Fixed sets the inputs to 0.
class Parts {
  public:
    explicit Parts(const Rows& function) : m_function(function) {}

    Rows Some(InputSet inputs) const
    {
        return Without(inputs, [](const Rows& low, const Rows& high) { return low | high; });
    }
    Rows All(InputSet inputs) const
    {
        return Without(inputs, [](const Rows& low, const Rows& high) { return low & high; });
    }
    Rows Fixed(InputSet inputs) const
    {
        return Without(inputs, [](const Rows& low, const Rows& /*high*/) { return low; });
    }

  private:
    template <class Merge>
    Rows Without(InputSet inputs, const Merge& merge) const
    {
        Rows result(m_function);
        for (; inputs != 0; inputs &= inputs - 1) {
            const auto input = static_cast<unsigned int>(__builtin_ctz(inputs));
            result = merge(Cofactor(result, input, false), Cofactor(result, input, true));
        }
        return result;
    }

    const Rows& m_function;
};

// The same for a function in one word, made for all sets at once: each from a set with one input
// less.
class WordParts {
  public:
    static constexpr unsigned int kMaxInputs = 6;

    explicit WordParts(const Rows& function) : m_num_inputs(function.NumInputs())
    {
        assert(m_num_inputs <= kMaxInputs);
        m_some[0] = m_all[0] = m_fixed[0] = function.Words()[0];
        for (InputSet inputs = 1; inputs < InputSet(1) << m_num_inputs; ++inputs) {
            const InputSet others = inputs & (inputs - 1);
            const unsigned int bit =
                m_num_inputs - 1 - static_cast<unsigned int>(__builtin_ctz(inputs));
            m_some[inputs] = Low(m_some[others], bit) | High(m_some[others], bit);
            m_all[inputs] = Low(m_all[others], bit) & High(m_all[others], bit);
            m_fixed[inputs] = Low(m_fixed[others], bit);
        }
    }

    Rows Some(InputSet inputs) const { return Rows::OfWord(m_num_inputs, m_some[inputs]); }
    Rows All(InputSet inputs) const { return Rows::OfWord(m_num_inputs, m_all[inputs]); }
    Rows Fixed(InputSet inputs) const { return Rows::OfWord(m_num_inputs, m_fixed[inputs]); }

  private:
    typedef std::array<uint64_t, size_t(1) << kMaxInputs> OfSets;

    static uint64_t Low(uint64_t word, unsigned int bit)
    {
        const uint64_t half = word & ~BitPattern(bit);
        return half | half << (1u << bit);
    }
    static uint64_t High(uint64_t word, unsigned int bit)
    {
        const uint64_t half = word & BitPattern(bit);
        return half | half >> (1u << bit);
    }

    unsigned int m_num_inputs;
    OfSets m_some;
    OfSets m_all;
    OfSets m_fixed;
};

// Moves the products with the most frequent literal to the front and takes it out of them. Returns
// the end of those products; 'begin' if the products have no literals.
Cube* TakeOutLiteral(Cube* begin, Cube* end, Cube& literal)
{
    std::array<std::array<uint16_t, 2>, kMaxCoverInputs> counts = {}; // at most kMaxProducts
    uint32_t allUsed = 0;
    for (const Cube* cube = begin; cube != end; ++cube) {
        allUsed |= cube->used;
        for (uint32_t used = cube->used; used != 0; used &= used - 1) {
            const auto input = static_cast<unsigned int>(__builtin_ctz(used));
            ++counts[input][cube->values >> input & 1u];
        }
    }
    size_t most = 0;
    for (; allUsed != 0; allUsed &= allUsed - 1) {
        const auto input = static_cast<unsigned int>(__builtin_ctz(allUsed));
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

// Takes out the most frequent literal, again and again. The products are changed.
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
    // Fails: false if a cover is too long. The depth is at most the number of inputs.
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

    // Two functions without a common input.
    bool FindSplit(const Rows& function, const std::vector<unsigned int>& support, Formula& formula)
    {
        if (support.size() > kMaxSplitInputs)
            return false;
        return function.NumInputs() <= WordParts::kMaxInputs
                   ? FindSplit(function, WordParts(function), support, formula)
                   : FindSplit(function, Parts(function), support, formula);
    }

    // The first input is always on the first side.
    template <class PartsOf>
    bool FindSplit(const Rows& function, const PartsOf& parts,
                   const std::vector<unsigned int>& support, Formula& formula)
    {
        const uint32_t numSets = uint32_t(1) << (support.size() - 1);
        for (uint32_t set = 1; set < numSets; ++set) {
            Watch();
            InputSet sides[2] = {InputSet(1) << support[0], 0};
            for (size_t place = 1; place < support.size(); ++place)
                sides[set >> (place - 1) & 1u] |= InputSet(1) << support[place];
            if (Split(function, parts, sides[0], sides[1], formula))
                return true;
        }
        return false;
    }

    template <class PartsOf>
    bool Split(const Rows& function, const PartsOf& parts, InputSet first, InputSet second,
               Formula& formula)
    {
        const Rows product[2] = {parts.Some(second), parts.Some(first)};
        if ((product[0] & product[1]) == function)
            return JoinParts(Operator::And, product[0], product[1], formula);
        const Rows sum[2] = {parts.All(second), parts.All(first)};
        if ((sum[0] | sum[1]) == function)
            return JoinParts(Operator::Or, sum[0], sum[1], formula);
        const Rows left = parts.Fixed(second);
        const Rows right = function.At(0) ? ~parts.Fixed(first) : parts.Fixed(first);
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

    // The shortest of the two factored covers and an expansion.
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

    // An expansion by one input: a multiplexer, or the exclusive OR of one part with the product of
    // the input and the change to the other part.
    struct Expansion {
        unsigned int input = 0;
        int kind = 0; // 0: a multiplexer; 1, 2: changes the part where the input is 0, or 1
    };

    // The expansion whose parts have the shortest covers.
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

    // True, with 'formula' set, if an expansion has fewer literals than 'leastLiterals'.
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
    // This proves what is printed, not what was meant to be written.
    result.isFound = ToFunction(result.expression) == function;
    const size_t numMattering = Support(rows).size();
    result.numLiterals = CountLiterals(formula);
    // Every input that matters must be mentioned, so mentioning each once is the least possible.
    result.isMinimal = numMattering <= kMaxShortestInputs || result.numLiterals == numMattering;
    return result;
}

} // namespace booleq
