// Inputs are coloured by the spectra's numbers of all sets that they are in, again and again as the
// colours of the other inputs in these sets become known. If some still look alike, one is singled
// out on both sides. Isomorphisms of graphs are found in this way: McKay and Piperno, Practical
// Graph Isomorphism II, 2014. Inversions are not tried: equations over the signs of the spectra
// give them.
#include "match.h"

#include <algorithm>
#include <array>
#include <cassert>
#include <chrono>
#include <utility>

#include "spectrum.h"
#include "watch.h"

namespace booleq {

namespace {

typedef std::vector<uint64_t> Colours; // of inputs, by the bit of the row number

uint64_t Mix(uint64_t value)
{
    value = (value ^ value >> 30) * 0xbf58476d1ce4e5b9u;
    value = (value ^ value >> 27) * 0x94d049bb133111ebu;
    return value ^ value >> 31;
}

// Equations between bits: the exclusive OR of the bits of a set has a given value.
class ParityEquations {
  public:
    // Fails: false if it contradicts the others.
    bool Add(uint32_t set, bool value)
    {
        for (unsigned int bit = 0; bit < m_rows.size() && set != 0; ++bit) {
            if ((set >> bit & 1u) == 0)
                continue;
            if (m_rows[bit].set == 0) {
                m_rows[bit] = {set, value};
                return true;
            }
            set ^= m_rows[bit].set;
            value = value != m_rows[bit].value;
        }
        return !value;
    }

    // A solution; free bits are 0.
    uint32_t Solve() const
    {
        uint32_t solution = 0;
        for (size_t bit = m_rows.size(); bit-- > 0;) {
            const bool others = (__builtin_popcount(m_rows[bit].set & solution) & 1) != 0;
            if (m_rows[bit].set != 0 && others != m_rows[bit].value)
                solution |= uint32_t(1) << bit;
        }
        return solution;
    }

  private:
    struct Row {
        uint32_t set = 0; // its lowest bit is the row's place
        bool value = false;
    };
    std::array<Row, kMaxMatchInputs + 1> m_rows;
};

// One of the two functions: its spectrum, and a number for each set of inputs that the allowed
// changes do not change.
struct Side {
    Side(const Rows& rows, bool allowInversions) : spectrum(WalshSpectrum(rows))
    {
        const std::vector<uint32_t> weights =
            allowInversions ? DerivativeWeights(rows) : std::vector<uint32_t>();
        for (size_t set = 0; set < spectrum.size(); ++set) {
            const int32_t value = allowInversions ? std::abs(spectrum[set]) : spectrum[set];
            const uint64_t weight = allowInversions ? weights[set] : 0;
            marks.push_back(Mix(static_cast<uint32_t>(value) | weight << 32));
        }
    }

    // The colours after one more look at all sets.
    Colours Refined(const Colours& colours, std::vector<uint64_t>& scratch) const
    {
        scratch.resize(marks.size());
        scratch[0] = 0;
        for (size_t set = 1; set < marks.size(); ++set)
            scratch[set] = scratch[set & (set - 1)] + colours[size_t(__builtin_ctzll(set))];
        for (size_t set = 0; set < marks.size(); ++set)
            scratch[set] = Mix(scratch[set] ^ marks[set]);
        Colours refined(colours.size());
        for (size_t input = 0; input < colours.size(); ++input) {
            uint64_t sum = 0;
            const size_t bit = size_t(1) << input;
            for (size_t start = bit; start < marks.size(); start += 2 * bit)
                for (size_t set = start; set < start + bit; ++set)
                    sum += scratch[set];
            refined[input] = Mix(sum ^ Mix(colours[input]));
        }
        return refined;
    }

    std::vector<int32_t> spectrum;
    std::vector<uint64_t> marks;
};

Colours Sorted(Colours colours)
{
    std::sort(colours.begin(), colours.end());
    return colours;
}

size_t CountColours(const Colours& colours)
{
    Colours sorted = Sorted(colours);
    return static_cast<size_t>(std::unique(sorted.begin(), sorted.end()) - sorted.begin());
}

enum class Outcome { kFound, kNone, kTimeIsUp };

class MatchSearch {
  public:
    MatchSearch(const Rows& first, const Rows& second, bool allowInversions, double seconds)
        : m_first(first, allowInversions), m_second(second, allowInversions),
          m_num_inputs(first.NumInputs()), m_allow_inversions(allowInversions), m_seconds(seconds),
          m_start(std::chrono::steady_clock::now())
    {
    }

    Outcome Run()
    {
        if (Sorted(m_first.marks) != Sorted(m_second.marks))
            return Outcome::kNone;
        return Find(Colours(m_num_inputs), Colours(m_num_inputs));
    }

    // For each bit of the second's row number, the bit of the first's.
    const std::vector<unsigned int>& Map() const { return m_map; }
    // Bit k: the second's input at bit k is inverted; bit numInputs: the output is.
    uint32_t Inversions() const { return m_inversions; }

  private:
    bool IsTimeUp() const
    {
        Watch();
        const std::chrono::duration<double> passed = std::chrono::steady_clock::now() - m_start;
        return m_seconds > 0 && passed.count() >= m_seconds;
    }

    // Tells apart all inputs that colours can tell apart.  Fails: false if the two sides differ.
    bool Refine(Colours& first, Colours& second)
    {
        for (size_t numColours = 0; numColours != CountColours(first);) {
            numColours = CountColours(first);
            first = m_first.Refined(first, m_scratch);
            second = m_second.Refined(second, m_scratch);
            if (Sorted(first) != Sorted(second))
                return false;
        }
        return true;
    }

    // The depth is the number of inputs.
    Outcome Find(Colours first, Colours second)
    {
        if (IsTimeUp())
            return Outcome::kTimeIsUp;
        if (!Refine(first, second) || !HoldsForSingles(first, second))
            return Outcome::kNone;
        const unsigned int pivot = SmallestGroup(second);
        if (pivot == m_num_inputs)
            return Outcome::kFound;
        const uint64_t colour = second[pivot];
        second[pivot] = kSingledOut;
        std::vector<unsigned int> failed;
        for (unsigned int turn = 0; turn < m_num_inputs; ++turn) {
            const unsigned int candidate = (pivot + turn) % m_num_inputs; // the same input first
            if (first[candidate] != colour || IsLikeOneOf(failed, candidate))
                continue;
            Colours singled(first);
            singled[candidate] = kSingledOut;
            const Outcome outcome = Find(singled, second);
            if (outcome != Outcome::kNone)
                return outcome;
            failed.push_back(candidate);
        }
        return Outcome::kNone;
    }

    // The first input of the smallest group of two or more inputs with one colour; the number of
    // inputs if every input has a colour of its own.
    unsigned int SmallestGroup(const Colours& colours) const
    {
        std::ptrdiff_t least = PTRDIFF_MAX;
        unsigned int pivot = m_num_inputs;
        for (unsigned int input = m_num_inputs; input-- > 0;) {
            const auto size = std::count(colours.begin(), colours.end(), colours[input]);
            if (size > 1 && size <= least) {
                least = size;
                pivot = input;
            }
        }
        return pivot;
    }

    // Maps the inputs that have a colour of their own by that colour. Whether they agree in all
    // their sets; keeps map and inversions.
    bool HoldsForSingles(const Colours& first, const Colours& second)
    {
        std::vector<unsigned int> singles;
        m_map.assign(m_num_inputs, 0);
        for (unsigned int input = 0; input < m_num_inputs; ++input) {
            if (std::count(second.begin(), second.end(), second[input]) != 1)
                continue;
            singles.push_back(input);
            m_map[input] = static_cast<unsigned int>(
                std::find(first.begin(), first.end(), second[input]) - first.begin());
        }
        return Holds(m_second, singles, m_map, m_inversions);
    }

    // Whether the sets of 'inputs' of 'side' have the same values as the mapped sets of the first
    // side, with signs that inversions explain.
    bool Holds(const Side& side, const std::vector<unsigned int>& inputs,
               const std::vector<unsigned int>& map, uint32_t& inversions) const
    {
        ParityEquations equations;
        const size_t numSets = size_t(1) << inputs.size();
        std::vector<uint32_t> own(numSets);
        std::vector<uint32_t> other(numSets);
        for (size_t number = 0; number < numSets; ++number) {
            if (number > 0) {
                const unsigned int input = inputs[size_t(__builtin_ctzll(number))];
                own[number] = own[number & (number - 1)] | uint32_t(1) << input;
                other[number] = other[number & (number - 1)] | uint32_t(1) << map[input];
            }
            const int32_t value = side.spectrum[own[number]];
            const int32_t mapped = m_first.spectrum[other[number]];
            if (value == mapped && (!m_allow_inversions || value == 0))
                continue;
            if (!m_allow_inversions || std::abs(value) != std::abs(mapped))
                return false;
            const uint32_t output = uint32_t(1) << m_num_inputs;
            if (!equations.Add(own[number] | output, (value < 0) != (mapped < 0)))
                return false;
        }
        inversions = equations.Solve();
        return true;
    }

    // Whether the first function stays the same when the candidate trades places with one of
    // 'others'.
    bool IsLikeOneOf(const std::vector<unsigned int>& others, unsigned int candidate) const
    {
        return std::any_of(others.begin(), others.end(), [&](unsigned int other) {
            std::vector<unsigned int> all;
            for (unsigned int input = 0; input < m_num_inputs; ++input)
                all.push_back(input);
            std::vector<unsigned int> map(all);
            std::swap(map[other], map[candidate]);
            uint32_t inversions = 0;
            return Holds(m_first, all, map, inversions);
        });
    }

    static constexpr uint64_t kSingledOut = 0x9e3779b97f4a7c15;

    Side m_first;
    Side m_second;
    unsigned int m_num_inputs;
    bool m_allow_inversions;
    double m_seconds;
    std::chrono::steady_clock::time_point m_start;
    std::vector<uint64_t> m_scratch;
    std::vector<unsigned int> m_map;
    uint32_t m_inversions = 0;
};

} // namespace

std::vector<unsigned int> EffectiveInputs(const Function& function)
{
    return Support(function.GetRows());
}

Matching Match(const Function& first, const Function& second, bool allowInversions, double seconds)
{
    const std::vector<unsigned int> ownInputs = EffectiveInputs(first);
    const std::vector<unsigned int> otherInputs = EffectiveInputs(second);
    Matching matching;
    if (ownInputs.size() != otherInputs.size())
        return matching;
    assert(ownInputs.size() <= kMaxMatchInputs);
    const auto numInputs = static_cast<unsigned int>(ownInputs.size());
    MatchSearch search(Restrict(first.GetRows(), ownInputs),
                       Restrict(second.GetRows(), otherInputs), allowInversions, seconds);
    const Outcome outcome = search.Run();
    matching.isFound = outcome == Outcome::kFound;
    matching.isDecided = outcome != Outcome::kTimeIsUp;
    if (!matching.isFound)
        return matching;
    matching.sources.assign(second.NumInputs(), Matching::kIdle);
    matching.inverted.assign(second.NumInputs(), false);
    for (unsigned int place = 0; place < numInputs; ++place) {
        const unsigned int bit = numInputs - 1 - place;
        matching.sources[otherInputs[place]] = ownInputs[numInputs - 1 - search.Map()[bit]];
        matching.inverted[otherInputs[place]] = (search.Inversions() >> bit & 1u) != 0;
    }
    matching.isInverted = (search.Inversions() >> numInputs & 1u) != 0;
    assert(Apply(matching, first, second.Inputs()) == second);
    return matching;
}

Function Apply(const Matching& matching, const Function& first,
               const std::vector<std::string>& inputs)
{
    const size_t numInputs = inputs.size();
    Rows rows(static_cast<unsigned int>(numInputs));
    for (size_t row = 0; row < rows.NumRows(); ++row) {
        uint64_t from = 0;
        for (size_t place = 0; place < numInputs; ++place) {
            if (matching.sources[place] == Matching::kIdle)
                continue;
            const bool value =
                ((row >> (numInputs - 1 - place) & 1u) != 0) != matching.inverted[place];
            from |= uint64_t(value ? 1 : 0) << (first.NumInputs() - 1 - matching.sources[place]);
        }
        rows.Set(row, first.At(from) != matching.isInverted);
    }
    return {inputs, std::move(rows)};
}

} // namespace booleq
