// Canonical forms, found block by block: Abdollahi and Pedram, "Symmetry detection and Boolean
// matching utilizing a signature-based canonical form", IEEE Transactions on CAD 27(6), 2008, and
// Huang, Wang, Nasikovskiy and Mishchenko, "Fast Boolean matching based on NPN classification", FPT
// 2013. Choices of first inputs follow the revolving-door order of combinations, which exchanges
// one input at a time: Knuth, The Art of Computer Programming 4A, section 7.2.1.3.
#include "canonical.h"

#include <algorithm>
#include <array>
#include <cassert>
#include <utility>

#include "canonical_tables.h"
#include "lut_word.h"
#include "parallel.h"

namespace booleq {

namespace {

constexpr size_t kPartSize = 1024; // tables; takes about a millisecond
constexpr unsigned int kMaxFirsts = kMaxCanonicalInputs - kMaxBlockInputs;
constexpr unsigned int kMaxChoices = 15; // of two first inputs of six
constexpr unsigned int kMaxBlocks = 1u << kMaxFirsts;
constexpr unsigned int kBlockRows = 1u << kMaxBlockInputs;
constexpr uint64_t kBlockMask = 0xffff;

// A choice of first inputs: an order of all inputs that begins with them, and the two bits whose
// exchange makes it from the choice before.
struct Choice {
    LutTransformation order;
    unsigned int low = 0; // bits of the row number
    unsigned int high = 0;
};

// Requires: 5 or 6 inputs.
std::vector<Choice> MakeChoices(unsigned int numInputs)
{
    // Each choice differs from the one before in one input.
    static const std::vector<std::vector<uint8_t>> kFives = {{0}, {1}, {2}, {3}, {4}};
    static const std::vector<std::vector<uint8_t>> kSixes = {
        {0, 1}, {1, 2}, {0, 2}, {0, 3}, {1, 3}, {2, 3}, {3, 4}, {2, 4},
        {1, 4}, {0, 4}, {0, 5}, {1, 5}, {2, 5}, {3, 5}, {4, 5}};
    std::vector<Choice> choices(1);
    for (const std::vector<uint8_t>& firsts : numInputs == 5 ? kFives : kSixes) {
        Choice choice = choices.back();
        uint8_t* const order = choice.order.order;
        const auto numFirsts = static_cast<std::ptrdiff_t>(firsts.size());
        for (const uint8_t input : firsts) {
            uint8_t* const found = std::find(order, order + numInputs, input);
            if (found - order < numFirsts)
                continue;
            uint8_t* const leaving = std::find_if(order, order + numFirsts, [&](uint8_t first) {
                return std::count(firsts.begin(), firsts.end(), first) == 0;
            });
            std::swap(*found, *leaving);
            choice.low = numInputs - 1 - static_cast<unsigned int>(found - order);
            choice.high = numInputs - 1 - static_cast<unsigned int>(leaving - order);
        }
        choices.push_back(choice);
    }
    choices.erase(choices.begin()); // the start, which equals the first choice
    return choices;
}

// A table part of the way to its form.
struct Candidate {
    uint64_t word = 0;  // what the table has become
    uint32_t begin = 0; // the transformations that leave its block as it is
    uint32_t end = 0;
    uint16_t function = 0; // of the block that is made least
    uint16_t toLeast = 0;  // index of the transformation that does that
    uint8_t choice = 0;
    uint8_t invertedFirsts = 0; // a set of places
    bool isInverted = false;
    bool areSwapped = false; // the two first inputs
};

// Finds forms, one at a time.
// The upper block of a table, the rows where its first inputs are 1, has four inputs. In the least
// table it is the least that any choice of first inputs, their inversions and the output's
// inversion can make of it; a table of all functions of four inputs gives that at once. Only the
// choices that make this least block are followed, and after that only what keeps it as it is.
class Canonicaliser {
  public:
    // Requires: 5 or 6 inputs.
    Canonicaliser(unsigned int numInputs, CanonicalScope scope)
        : m_num_inputs(numInputs), m_num_blocks(1u << (numInputs - kMaxBlockInputs)),
          m_has_inversions(scope != CanonicalScope::Order), m_choices(MakeChoices(numInputs)),
          m_tables(BlockTablesOf(kMaxBlockInputs, scope))
    {
    }

    CanonicalLut Find(uint64_t table)
    {
        FollowBestChoices(table);
        assert(m_num_candidates > 0);
        FinishCandidates();
        CanonicalLut found;
        found.form = UINT64_MAX;
        const Candidate* best = nullptr;
        uint16_t bestIndex = 0; // of a transformation that leaves the best's block as it is
        for (size_t place = 0; place < m_num_candidates; ++place) {
            const Candidate& candidate = m_candidates[place];
            for (uint32_t at = candidate.begin; at < candidate.end; ++at) {
                const uint16_t index = m_tables.stabilisers[at];
                const uint64_t word =
                    ApplyToBlocks(m_tables.transformations[index], candidate.word);
                if (word < found.form || best == nullptr) {
                    found.form = word;
                    best = &candidate;
                    bestIndex = index;
                }
            }
        }
        assert(best != nullptr); // a candidate has at least one transformation
        found.transformation = TransformationOf(*best, bestIndex);
        assert(Transform(found.transformation, table, m_num_inputs) == found.form);
        return found;
    }

  private:
    // Collects the candidates with the least upper block.
    void FollowBestChoices(uint64_t table)
    {
        const unsigned int topBlock = m_num_blocks - 1;
        uint16_t least = UINT16_MAX;
        for (size_t place = 0; place < m_choices.size(); ++place) {
            if (place > 0)
                table = SwapLutBits(table, m_choices[place].low, m_choices[place].high);
            m_words[place] = table;
            for (unsigned int block = m_has_inversions ? 0 : topBlock; block <= topBlock; ++block) {
                const auto function = static_cast<uint16_t>(table >> (kBlockRows * block));
                const auto inverse = static_cast<uint16_t>(~function);
                uint16_t* const leasts = &m_leasts[place][size_t(2) * block];
                leasts[0] = m_tables.least[function];
                leasts[1] = m_has_inversions ? m_tables.least[inverse] : UINT16_MAX;
                least = std::min({least, leasts[0], leasts[1]});
            }
        }
        m_bound = UINT64_MAX;
        m_num_candidates = 0;
        for (size_t place = 0; place < m_choices.size(); ++place)
            for (unsigned int block = m_has_inversions ? 0 : topBlock; block <= topBlock; ++block)
                for (const bool isInverted : {false, true})
                    if (m_leasts[place][2 * block + (isInverted ? 1 : 0)] == least &&
                        (m_has_inversions || !isInverted))
                        Follow(place, block, isInverted);
    }

    // Makes a block the upper one.
    void Follow(size_t choice, unsigned int block, bool isInverted)
    {
        Candidate candidate;
        candidate.choice = static_cast<uint8_t>(choice);
        candidate.isInverted = isInverted;
        candidate.word = isInverted ? ~m_words[choice] & RowMask(m_num_inputs) : m_words[choice];
        const unsigned int moves = block ^ (m_num_blocks - 1);
        for (unsigned int first = 0; first < m_num_inputs - kMaxBlockInputs; ++first) {
            const unsigned int bit = m_num_inputs - 1 - first;
            if ((moves >> (bit - kMaxBlockInputs) & 1u) == 0)
                continue;
            candidate.invertedFirsts = static_cast<uint8_t>(candidate.invertedFirsts | 1u << first);
            candidate.word = InvertLutBit(candidate.word, bit);
        }
        Keep(candidate);
        if (m_num_blocks < kMaxBlocks)
            return;
        candidate.areSwapped = true;
        candidate.word = SwapLutBits(candidate.word, 4, 5);
        Keep(candidate);
    }

    // Keeps a candidate unless one with a lesser bound is known. Constant blocks stay as they are,
    // whatever is done to the inputs of the blocks; the first block that is not constant becomes
    // the least of its class.
    void Keep(Candidate candidate)
    {
        unsigned int block = m_num_blocks;
        uint64_t bound = 0;
        uint64_t function = 0;
        do {
            --block;
            function = candidate.word >> (kBlockRows * block) & kBlockMask;
            bound |= uint64_t(m_tables.least[static_cast<size_t>(function)])
                     << (kBlockRows * block);
        } while (block > 0 && (function == 0 || function == kBlockMask));
        if (bound > m_bound)
            return;
        if (bound < m_bound)
            m_num_candidates = 0;
        m_bound = bound;
        candidate.function = static_cast<uint16_t>(function);
        m_candidates[m_num_candidates++] = candidate;
    }

    // Makes the block with which the bound ends the least of its class, and drops candidates whose
    // words are now equal.
    void FinishCandidates()
    {
        for (size_t place = 0; place < m_num_candidates; ++place) {
            Candidate& candidate = m_candidates[place];
            candidate.toLeast = m_tables.toLeast[candidate.function];
            candidate.word =
                ApplyToBlocks(m_tables.transformations[candidate.toLeast], candidate.word);
            assert(candidate.word >= m_bound);
            const size_t classIndex = m_tables.classOf[candidate.function];
            candidate.begin = m_tables.stabiliserBegins[classIndex];
            candidate.end = m_tables.stabiliserBegins[classIndex + 1];
            if (candidate.function == 0 || candidate.function == kBlockMask)
                candidate.end = candidate.begin + 1; // all blocks are constants
        }
        const auto begin = m_candidates.begin();
        const auto end = begin + static_cast<std::ptrdiff_t>(m_num_candidates);
        std::sort(begin, end, [](const Candidate& left, const Candidate& right) {
            return left.word < right.word;
        });
        m_num_candidates =
            static_cast<size_t>(std::unique(begin, end,
                                            [](const Candidate& left, const Candidate& right) {
                                                return left.word == right.word;
                                            }) -
                                begin);
    }

    // From the table to the form: the choice, its inversions, and two transformations of the
    // blocks' inputs.
    LutTransformation TransformationOf(const Candidate& candidate, uint16_t index) const
    {
        LutTransformation result = m_choices[candidate.choice].order;
        result.invertedInputs = candidate.invertedFirsts;
        result.invertsOutput = candidate.isInverted ? 1 : 0;
        if (candidate.areSwapped) {
            LutTransformation exchange;
            std::swap(exchange.order[0], exchange.order[1]);
            result = Compose(result, exchange);
        }
        result = Compose(result, OfAllInputs(candidate.toLeast));
        return Compose(result, OfAllInputs(index));
    }

    // A transformation of the blocks' inputs, which are the last ones, as one of all inputs.
    LutTransformation OfAllInputs(uint16_t index) const
    {
        const LutTransformation& ofBlock = m_tables.transformations[index].meaning;
        const unsigned int numFirsts = m_num_inputs - kMaxBlockInputs;
        LutTransformation result;
        for (unsigned int place = 0; place < kMaxBlockInputs; ++place)
            result.order[numFirsts + place] =
                static_cast<uint8_t>(numFirsts + ofBlock.order[place]);
        result.invertedInputs = static_cast<uint8_t>(ofBlock.invertedInputs << numFirsts);
        return result;
    }

    unsigned int m_num_inputs;
    unsigned int m_num_blocks;
    bool m_has_inversions;
    std::vector<Choice> m_choices;
    const BlockTables& m_tables;
    // Of the table at hand:
    std::array<uint64_t, kMaxChoices> m_words;
    std::array<std::array<uint16_t, size_t(2) * kMaxBlocks>, kMaxChoices> m_leasts;
    uint64_t m_bound = 0; // the least form that the settled blocks allow
    std::array<Candidate, size_t(4) * kMaxBlocks * kMaxChoices> m_candidates;
    size_t m_num_candidates = 0;
};

// Up to four inputs: the form is in the tables.
CanonicalLut FindSmall(uint64_t wanted, unsigned int numInputs, CanonicalScope scope)
{
    const BlockTables& tables = BlockTablesOf(numInputs, scope);
    const auto table = static_cast<size_t>(wanted); // of at most 2^16
    const auto inverse = static_cast<size_t>(~wanted & RowMask(numInputs));
    const bool isInverted =
        scope != CanonicalScope::Order && tables.least[inverse] < tables.least[table];
    const size_t chosen = isInverted ? inverse : table;
    CanonicalLut found;
    found.form = tables.least[chosen];
    found.transformation = tables.transformations[tables.toLeast[chosen]].meaning;
    found.transformation.invertsOutput = isInverted ? 1 : 0;
    assert(Transform(found.transformation, table, numInputs) == found.form);
    return found;
}

} // namespace

CanonicalLut FindCanonical(uint64_t table, unsigned int numInputs, CanonicalScope scope)
{
    assert(numInputs <= kMaxCanonicalInputs);
    assert((table & ~RowMask(numInputs)) == 0);
    if (numInputs <= kMaxBlockInputs)
        return FindSmall(table, numInputs, scope);
    return Canonicaliser(numInputs, scope).Find(table);
}

void FindCanonicals(const LutArray& luts, CanonicalScope scope, void* forms,
                    LutTransformation* transformations, const LutWork& work)
{
    assert(luts.numInputs <= kMaxCanonicalInputs);
    WithLutWord(luts, [&](auto zero) {
        typedef decltype(zero) Word;
        const auto* const tables = static_cast<const Word*>(luts.tables);
        auto* const words = static_cast<Word*>(forms);
        RunInParts(luts.count, kPartSize, work, [&](size_t begin, size_t end) {
            const auto run = [&](const auto& find) {
                for (size_t place = begin; place < end; ++place) {
                    const CanonicalLut found = find(LutWord<Word>::Lower(tables[place]));
                    words[place] = LutWord<Word>::Of(found.form, 0);
                    if (transformations != nullptr)
                        transformations[place] = found.transformation;
                }
            };
            if (luts.numInputs <= kMaxBlockInputs) {
                run([&](uint64_t table) { return FindSmall(table, luts.numInputs, scope); });
                return;
            }
            Canonicaliser canonicaliser(luts.numInputs, scope);
            run([&](uint64_t table) { return canonicaliser.Find(table); });
        });
    });
}

} // namespace booleq
