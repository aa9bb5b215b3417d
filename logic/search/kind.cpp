#include "kind.h"

#include <algorithm>

#include "cover.h"
#include "rows.h"
#include "text.h"

namespace booleq {

namespace {

// A function of the inputs that matter, with ways to ask about it.
class Explainer {
  public:
    explicit Explainer(const Function& function)
        : m_names(function.Inputs()), m_rows(function.GetRows()), m_support(Support(m_rows))
    {
    }

    void Run(FunctionKind& found)
    {
        for (unsigned int input = 0; input < m_rows.NumInputs(); ++input) {
            const bool matters = std::count(m_support.begin(), m_support.end(), input) != 0;
            (matters ? found.mattering : found.idle).push_back(m_names[input]);
        }
        m_found = &found;
        FindConstant() || FindProduct() || FindParity() || FindMultiplexer() || FindThreshold() ||
            FindAndOr() || FindSymmetric();
    }

  private:
    bool Say(const std::string& kind, const std::string& text)
    {
        m_found->kind = kind;
        m_found->text = text;
        return true;
    }

    std::string Literal(unsigned int input, bool isInverted) const
    {
        return (isInverted ? "~" : "") + m_names[input];
    }

    // The cofactor for one assignment to the inputs of 'inputs'; bit k of 'values' is for the k-th.
    Rows FixTo(const std::vector<unsigned int>& inputs, uint32_t values) const
    {
        Rows result(m_rows);
        for (size_t place = 0; place < inputs.size(); ++place)
            result = Cofactor(result, inputs[place], (values >> place & 1u) != 0);
        return result;
    }

    // Fails: false if the function is not a single literal.
    bool AsLiteral(const Rows& rows, unsigned int& input, std::string& literal) const
    {
        const std::vector<unsigned int> support = Support(rows);
        if (support.size() != 1)
            return false;
        input = support[0];
        literal = Literal(input, rows.At(0));
        return true;
    }

    // A constant, or a single input or its inversion.
    bool FindConstant()
    {
        if (m_support.empty())
            return Say("constant", IsOne(m_rows) ? "constant 1" : "constant 0");
        if (m_support.size() > 1)
            return false;
        const bool isInverter = m_rows.At(0);
        const std::string& name = m_names[m_support[0]];
        return Say(isInverter ? "inverter" : "buffer",
                   (isInverter ? "inverter of " : "buffer of ") + name);
    }

    // Exactly one row over the inputs that matter is 1, or exactly one is 0.
    bool FindProduct()
    {
        const std::vector<Cube> cover = FindCover(m_rows);
        const std::vector<Cube> inverse = FindCover(~m_rows);
        const bool isAnd = cover.size() == 1;
        if (!isAnd && inverse.size() != 1)
            return false;
        const Cube cube = isAnd ? cover[0] : inverse[0];
        std::vector<std::string> plain;
        std::vector<std::string> literals;
        size_t numInverted = 0;
        for (const unsigned int input : m_support) {
            const bool isInverted = ((cube.values >> input & 1u) != 0) != isAnd;
            numInverted += isInverted ? 1 : 0;
            plain.push_back(m_names[input]);
            literals.push_back(Literal(input, isInverted));
        }
        const bool isAll = numInverted == literals.size();
        const std::string kind = isAnd ? (isAll ? "NOR" : "AND") : (isAll ? "NAND" : "OR");
        return Say(kind, kind + " of " + Join(isAll ? plain : literals, ", "));
    }

    bool FindParity()
    {
        Rows parity = InputRows(m_rows.NumInputs(), m_support[0]);
        std::vector<std::string> names = {m_names[m_support[0]]};
        for (size_t place = 1; place < m_support.size(); ++place) {
            parity = parity ^ InputRows(m_rows.NumInputs(), m_support[place]);
            names.push_back(m_names[m_support[place]]);
        }
        if (m_rows == parity)
            return Say("XOR", "XOR of " + Join(names, ", ") + ": 1 when an odd number is 1");
        if (m_rows == ~parity)
            return Say("XNOR", "XNOR of " + Join(names, ", ") + ": 1 when an even number is 1");
        return false;
    }

    // One select and two data inputs, or two selects and four.
    bool FindMultiplexer()
    {
        const size_t size = m_support.size();
        if (size == 3) {
            for (const unsigned int select : m_support)
                if (IsMultiplexer({select}))
                    return true;
        }
        if (size == 6) {
            for (size_t high = 0; high < size; ++high)
                for (size_t low = high + 1; low < size; ++low)
                    if (IsMultiplexer({m_support[high], m_support[low]}))
                        return true;
        }
        return false;
    }

    bool IsMultiplexer(const std::vector<unsigned int>& selects)
    {
        std::vector<std::string> choices;
        std::vector<unsigned int> data = selects;
        const uint32_t numChoices = uint32_t(1) << selects.size();
        for (uint32_t values = numChoices; values-- > 0;) {
            unsigned int input = 0;
            std::string literal;
            if (!AsLiteral(FixTo(selects, values), input, literal) ||
                std::count(data.begin(), data.end(), input) != 0)
                return false;
            data.push_back(input);
            literal += " for ";
            for (size_t place = 0; place < selects.size(); ++place)
                literal.append(place == 0 ? "" : ", ")
                    .append(m_names[selects[place]])
                    .append((values >> place & 1u) != 0 ? "=1" : "=0");
            choices.push_back(std::move(literal));
        }
        std::vector<std::string> names;
        names.reserve(selects.size());
        for (const unsigned int select : selects)
            names.push_back(m_names[select]);
        return Say("multiplexer",
                   "multiplexer, select " + Join(names, ", ") + ": " + Join(choices, "; "));
    }

    // For each input that matters, whether it must be inverted for the function to rise with it.
    // Fails: false if some input makes the function both rise and fall.
    bool FindDirections(uint32_t& inverted) const
    {
        inverted = 0;
        for (const unsigned int input : m_support) {
            const Rows low = Cofactor(m_rows, input, false);
            const Rows high = Cofactor(m_rows, input, true);
            if ((low & high) == high)
                inverted |= uint32_t(1) << input;
            else if ((low & high) != low)
                return false;
        }
        return true;
    }

    // Element k: whether the function is 1 when k literals are 1. Empty if it does not depend on
    // that number alone.
    std::vector<int> ByCount(uint32_t inverted) const
    {
        std::vector<int> values(m_support.size() + 1, -1);
        for (uint64_t row = 0; row < m_rows.NumRows(); ++row) {
            size_t count = 0;
            for (const unsigned int input : m_support) {
                const bool bit = (row >> (m_rows.NumInputs() - 1 - input) & 1u) != 0;
                count += bit != ((inverted >> input & 1u) != 0) ? 1 : 0;
            }
            const int value = m_rows.At(row) ? 1 : 0;
            if (values[count] != -1 && values[count] != value)
                return {};
            values[count] = value;
        }
        return values;
    }

    std::vector<std::string> Literals(uint32_t inverted) const
    {
        std::vector<std::string> literals;
        for (const unsigned int input : m_support)
            literals.push_back(Literal(input, (inverted >> input & 1u) != 0));
        return literals;
    }

    bool FindThreshold()
    {
        uint32_t inverted = 0;
        if (!FindDirections(inverted))
            return false;
        const std::vector<int> values = ByCount(inverted);
        if (values.empty())
            return false;
        const auto needed = std::find(values.begin(), values.end(), 1) - values.begin();
        const std::string literals = Join(Literals(inverted), ", ");
        if (2 * needed == static_cast<std::ptrdiff_t>(m_support.size()) + 1)
            return Say("majority", "majority of " + literals);
        return Say("threshold",
                   "at least " + std::to_string(needed) + " of " + literals + " are 1");
    }

    bool FindSymmetric()
    {
        const std::vector<int> values = ByCount(0);
        if (values.empty())
            return false;
        std::vector<std::string> counts;
        for (size_t count = 0; count < values.size(); ++count)
            if (values[count] == 1)
                counts.push_back(std::to_string(count));
        return Say("symmetric", "1 when the number of ones among " + Join(Literals(0), ", ") +
                                    " is " + Join(counts, " or "));
    }

    // An and-or is a sum of products without a common input; the other three forms are inversions
    // of it.
    bool FindAndOr()
    {
        return IsAndOr(FindCover(m_rows), false) || IsAndOr(FindCover(~m_rows), true);
    }

    bool IsAndOr(const std::vector<Cube>& cover, bool isInverse)
    {
        uint32_t used = 0;
        size_t numPlain = 0;
        for (const Cube& cube : cover) {
            if ((used & cube.used) != 0)
                return false;
            used |= cube.used;
            numPlain += static_cast<size_t>(__builtin_popcount(cube.values));
        }
        // If most literals are inverted, the sum is the inversion of a product of sums of plain
        // ones.
        const bool isOrAnd = 2 * numPlain < CountLiterals(cover);
        const bool hasInvertedOutput = isInverse != isOrAnd;
        std::vector<std::pair<size_t, std::string>> groups;
        for (const Cube& cube : cover) {
            std::vector<std::string> literals;
            for (const unsigned int input : m_support)
                if ((cube.used >> input & 1u) != 0)
                    literals.push_back(
                        Literal(input, ((cube.values >> input & 1u) != 0) == isOrAnd));
            const std::string group = Join(literals, isOrAnd ? " | " : " & ");
            groups.emplace_back(literals.size(), literals.size() > 1 ? "(" + group + ")" : group);
        }
        std::stable_sort(groups.begin(), groups.end(), [](const auto& left, const auto& right) {
            return left.first > right.first;
        });
        std::string sizes;
        std::vector<std::string> texts;
        for (const auto& group : groups) {
            sizes += std::to_string(group.first);
            texts.push_back(group.second);
        }
        std::string text = Join(texts, isOrAnd ? " & " : " | ");
        if (hasInvertedOutput)
            text = "~(" + text + ")";
        const std::string kind =
            std::string(isOrAnd ? "or-and" : "and-or") + (hasInvertedOutput ? "-invert" : "");
        const std::string shape =
            std::string(isOrAnd ? "OA" : "AO") + (hasInvertedOutput ? "I" : "") + sizes;
        return Say(kind, kind + " (" + shape + "): " + text);
    }

    const std::vector<std::string>& m_names;
    Rows m_rows;
    std::vector<unsigned int> m_support;
    FunctionKind* m_found = nullptr;
};

} // namespace

FunctionKind FindKind(const Function& function)
{
    FunctionKind found;
    Explainer(function).Run(found);
    return found;
}

} // namespace booleq
