// EXPAND: growth of one cube against the off-set, and of a cover cube by cube.
#include "expand.h"

#include <algorithm>
#include <numeric>

#include "unate.h"

namespace booleq {

Expander::Expander(const TwoLevelProblem& problem, Work& work)
    : m_problem(problem), m_space(problem.space), m_off(problem.off), m_work(work),
      m_num_words(m_space.NumWords()), m_raised(m_num_words), m_free(m_num_words),
      m_blocked(m_num_words), m_scratch(m_num_words), m_order(m_off.Size())
{
    std::iota(m_order.begin(), m_order.end(), 0u);
}

bool Expander::IsImplicant(const uint64_t* cube)
{
    if (!m_problem.hasOff)
        return IsCovered(m_space, cube, m_problem.on, m_problem.on.Size(), m_problem.free, m_work);
    for (size_t place = 0; place < m_order.size(); ++place) {
        if (IsDisjoint(m_space, cube, m_off.At(m_order[place])))
            continue;
        std::swap(m_order[place], m_order[place / 2]); // those that object come to the front
        m_work.Spend(place + 1);
        return false;
    }
    m_work.Spend(m_off.Size());
    return true;
}

void Expander::Expand(uint64_t* cube, const uint64_t* allowed, const CubeList& others,
                      const std::vector<uint8_t>& isOpen)
{
    for (size_t word = 0; word < m_num_words; ++word) {
        m_raised[word] = cube[word];
        m_free[word] = m_space.All(word) & ~cube[word] & (allowed ? allowed[word] : ~uint64_t(0));
    }
    m_active.resize(m_off.Size());
    std::iota(m_active.begin(), m_active.end(), 0u);
    m_candidates.clear();
    for (size_t index = 0; index < others.Size(); ++index)
        if (isOpen[index] != 0)
            m_candidates.push_back(static_cast<uint32_t>(index));
    if (!m_problem.hasOff) {
        ExpandByTautology(cube, others);
        return;
    }
    Settle();
    CoverOthers(others);
    while (!m_active.empty())
        RaiseLeastBlocked();
    for (size_t word = 0; word < m_num_words; ++word)
        cube[word] = m_raised[word] | m_free[word];
}

// Decides what is decided: parts that would meet an off cube at once are lowered, parts that no
// active cube asks for are raised.
void Expander::Settle()
{
    while (LowerAndDrop()) {
    }
    for (size_t word = 0; word < m_num_words; ++word) {
        m_raised[word] |= m_free[word] & ~m_blocked[word];
        m_free[word] &= m_blocked[word];
    }
}

// One pass over the active cubes. True when a part was lowered, so that more cubes may be inactive.
bool Expander::LowerAndDrop()
{
    m_work.Spend(m_active.size() * m_num_words + 1);
    switch (m_num_words) {
    case 1:
        return LowerAndDropIn<1>();
    case 2:
        return LowerAndDropIn<2>();
    default:
        return LowerAndDropIn<0>();
    }
}

// 'kNumWords' is the number of words if the compiler is to know it, else 0.
template <size_t kNumWords>
bool Expander::LowerAndDropIn()
{
    const size_t numWords = kNumWords > 0 ? kNumWords : m_num_words;
    const uint64_t* const raised = m_raised.data();
    uint64_t* const free = m_free.data();
    uint64_t* const missing = m_scratch.data();
    uint64_t* const blocked = m_blocked.data();
    uint64_t lows[kNumWords > 0 ? kNumWords : 1] = {};
    uint64_t outs[kNumWords > 0 ? kNumWords : 1] = {};
    for (size_t word = 0; word < kNumWords; ++word) {
        lows[word] = m_space.InputLow(word);
        outs[word] = m_space.Outputs(word);
    }
    bool isLowered = false;
    std::fill(m_blocked.begin(), m_blocked.end(), 0);
    size_t numActive = 0;
    for (const uint32_t index : m_active) {
        const uint64_t* const off = m_off.At(index);
        size_t distance = 0; // exact up to 1
        uint64_t unreachable = 0;
        uint64_t commonOutputs = 0;
        uint64_t reachableOutputs = 0;
        for (size_t word = 0; word < numWords; ++word) {
            const uint64_t low = kNumWords > 0 ? lows[word] : m_space.InputLow(word);
            const uint64_t out = kNumWords > 0 ? outs[word] : m_space.Outputs(word);
            const uint64_t common = raised[word] & off[word];
            const uint64_t conflicts = low & ~(common | common >> 1);
            missing[word] = off[word] & conflicts * 3;
            // Of each pair in conflict one part of the off cube must still be free.
            const uint64_t open = missing[word] & free[word];
            unreachable |= conflicts & ~(open | open >> 1);
            distance += (conflicts != 0 ? 1u : 0u) + ((conflicts & (conflicts - 1)) != 0 ? 1u : 0u);
            commonOutputs |= common & out;
            reachableOutputs |= off[word] & free[word] & out;
        }
        if (unreachable != 0 || (commonOutputs | reachableOutputs) == 0)
            continue;
        if (commonOutputs == 0) {
            ++distance;
            for (size_t word = 0; word < numWords; ++word)
                missing[word] |= off[word] & m_space.Outputs(word);
        }
        assert(distance > 0); // invariant 1
        if (distance == 1) {
            for (size_t word = 0; word < numWords; ++word)
                free[word] &= ~missing[word];
            isLowered = true; // and the cube cannot be met any more
            continue;
        }
        for (size_t word = 0; word < numWords; ++word)
            blocked[word] |= missing[word];
        m_active[numActive++] = index;
    }
    m_active.resize(numActive);
    return isLowered;
}

// Whether the supercube of m_raised and 'with' meets no off cube.
// Requires: 'with' has no parts outside m_raised and m_free.
bool Expander::IsFeasible(const uint64_t* with)
{
    for (size_t word = 0; word < m_num_words; ++word)
        m_scratch[word] = m_raised[word] | with[word];
    for (size_t place = 0; place < m_active.size(); ++place) {
        if (!IsDisjoint(m_space, m_scratch.data(), m_off.At(m_active[place]))) {
            m_work.Spend(place + 1);
            std::swap(m_active[place], m_active[place / 2]); // those that object come to the front
            return false;
        }
    }
    m_work.Spend(m_active.size());
    return true;
}

// Takes in the others one by one, as long as there is one that could be; then heads for them.
void Expander::CoverOthers(const CubeList& others)
{
    for (;;) {
        const size_t numFeasible = FilterCandidates(others);
        if (m_candidates.empty() || m_active.empty())
            return;
        if (numFeasible > 0)
            RaiseBest(others, numFeasible);
        else
            RaiseMostFrequent(others);
    }
}

// Keeps candidates that lie in m_raised and m_free but not in m_raised alone, feasible ones first,
// and counts the feasible ones.
size_t Expander::FilterCandidates(const CubeList& others)
{
    m_work.Spend(m_candidates.size());
    size_t numKept = 0;
    for (const uint32_t candidate : m_candidates) {
        const uint64_t* cube = others.At(candidate);
        bool isReachable = true;
        uint64_t missing = 0;
        for (size_t word = 0; word < m_num_words; ++word) {
            missing |= cube[word] & ~m_raised[word];
            isReachable = isReachable && (cube[word] & ~(m_raised[word] | m_free[word])) == 0;
        }
        if (isReachable && missing != 0)
            m_candidates[numKept++] = candidate;
    }
    m_candidates.resize(numKept);
    size_t numFeasible = 0;
    for (size_t place = 0; place < numKept; ++place)
        if (IsFeasible(others.At(m_candidates[place])))
            std::swap(m_candidates[place], m_candidates[numFeasible++]);
    return numFeasible;
}

namespace {

bool IsAtDistanceOne(const CubeSpace& space, const uint64_t* left, const uint64_t* right)
{
    size_t distance = HasCommonOutput(space, left, right) ? 0 : 1;
    for (size_t word = 0; word < space.NumInputWords() && distance <= 1; ++word) {
        const uint64_t conflicts = InputConflicts(space, left, right, word);
        distance += (conflicts != 0 ? 1u : 0u) + ((conflicts & (conflicts - 1)) != 0 ? 1u : 0u);
    }
    return distance == 1;
}

} // namespace

// How many candidates could still be taken in, as far as parts that are then lowered at once tell.
size_t Expander::CountAfter(const CubeList& others, size_t numFeasible, const uint64_t* with)
{
    std::vector<uint64_t> reach(m_num_words);
    std::vector<uint64_t> raised(m_num_words);
    for (size_t word = 0; word < m_num_words; ++word) {
        raised[word] = m_raised[word] | with[word];
        reach[word] = m_raised[word] | m_free[word];
    }
    m_work.Spend(m_active.size() + numFeasible);
    for (const uint32_t place : m_active) {
        const uint64_t* off = m_off.At(place);
        if (!IsAtDistanceOne(m_space, raised.data(), off))
            continue;
        for (size_t word = 0; word < m_num_words; ++word)
            reach[word] &= ~(off[word] & InputConflicts(m_space, raised.data(), off, word) * 3);
        if (!HasCommonOutput(m_space, raised.data(), off))
            for (size_t word = m_space.FirstOutputWord(); word < m_num_words; ++word)
                reach[word] &= ~(off[word] & m_space.Outputs(word));
    }
    size_t count = 0;
    for (size_t place = 0; place < numFeasible; ++place)
        if (Contains(reach.data(), others.At(m_candidates[place]), m_num_words))
            ++count;
    return count;
}

// Takes in the feasible candidate after which most others can be taken in; of equal ones the one
// that raises fewest parts.
void Expander::RaiseBest(const CubeList& others, size_t numFeasible)
{
    size_t best = 0;
    size_t bestCount = 0;
    size_t bestRaised = SIZE_MAX;
    for (size_t place = 0; place < numFeasible && numFeasible > 1; ++place) {
        const uint64_t* cube = others.At(m_candidates[place]);
        const size_t count = CountAfter(others, numFeasible, cube);
        size_t numRaised = 0;
        for (size_t word = 0; word < m_num_words; ++word)
            numRaised += CountBits(cube[word] & ~m_raised[word]);
        if (count > bestCount || (count == bestCount && numRaised < bestRaised)) {
            best = place;
            bestCount = count;
            bestRaised = numRaised;
        }
    }
    const uint64_t* cube = others.At(m_candidates[best]);
    for (size_t word = 0; word < m_num_words; ++word) {
        m_raised[word] |= cube[word];
        m_free[word] &= ~cube[word];
    }
    Settle();
}

void Expander::Raise(size_t bit)
{
    assert(GetBit(m_free.data(), bit));
    SetBit(m_raised.data(), bit);
    ClearBit(m_free.data(), bit);
    Settle();
}

// Raises the free part that most candidates have.
void Expander::RaiseMostFrequent(const CubeList& others)
{
    m_counts.assign(64 * m_num_words, 0);
    for (const uint32_t candidate : m_candidates)
        for (size_t word = 0; word < m_num_words; ++word)
            for (uint64_t rest = others.At(candidate)[word] & m_free[word]; rest != 0;
                 rest &= rest - 1)
                ++m_counts[64 * word + LowestBit(rest)];
    const auto best = std::max_element(m_counts.begin(), m_counts.end());
    assert(*best > 0);
    Raise(static_cast<size_t>(best - m_counts.begin()));
}

// Raises the free part that fewest active cubes ask for.
void Expander::RaiseLeastBlocked()
{
    m_work.Spend(m_active.size() * m_num_words);
    m_counts.assign(64 * m_num_words, 0);
    for (const uint32_t index : m_active) {
        const uint64_t* off = m_off.At(index);
        for (size_t word = 0; word < m_num_words; ++word) {
            uint64_t rest = off[word] & m_free[word];
            for (; rest != 0; rest &= rest - 1)
                ++m_counts[64 * word + LowestBit(rest)];
        }
    }
    size_t best = SIZE_MAX;
    for (size_t bit = 0; bit < m_counts.size(); ++bit)
        if (GetBit(m_free.data(), bit) && (best == SIZE_MAX || m_counts[bit] < m_counts[best]))
            best = bit;
    assert(best != SIZE_MAX); // invariant 3: an active cube needs free parts
    Raise(best);
}

std::vector<uint32_t> OrderByWeight(const CubeSpace& space, const CubeList& cubes)
{
    std::vector<uint64_t> columns(64 * space.NumWords());
    for (size_t index = 0; index < cubes.Size(); ++index)
        for (size_t word = 0; word < space.NumWords(); ++word)
            for (uint64_t rest = cubes.At(index)[word]; rest != 0; rest &= rest - 1)
                ++columns[64 * word + LowestBit(rest)];
    std::vector<uint64_t> weights(cubes.Size());
    for (size_t index = 0; index < cubes.Size(); ++index)
        for (size_t word = 0; word < space.NumWords(); ++word)
            for (uint64_t rest = cubes.At(index)[word]; rest != 0; rest &= rest - 1)
                weights[index] += columns[64 * word + LowestBit(rest)];
    std::vector<uint32_t> order(cubes.Size());
    std::iota(order.begin(), order.end(), 0u);
    std::stable_sort(order.begin(), order.end(),
                     [&](uint32_t left, uint32_t right) { return weights[left] < weights[right]; });
    return order;
}

void ExpandCover(const CubeSpace& space, Expander& expander, const uint64_t* allowed, Cover& cover,
                 Work& work)
{
    CubeList& cubes = cover.cubes;
    std::vector<uint8_t> isKept(cubes.Size(), 1);
    std::vector<uint8_t> isOpen(cubes.Size());
    for (size_t index = 0; index < cubes.Size(); ++index)
        isOpen[index] = cover.isPrime[index] != 0 ? 0 : 1;
    for (const uint32_t index : OrderByWeight(space, cubes)) {
        if (isKept[index] == 0 || cover.isPrime[index] != 0)
            continue;
        isOpen[index] = 0;
        expander.Expand(cubes.At(index), allowed, cubes, isOpen);
        cover.isPrime[index] = allowed ? 0 : 1;
        work.Spend(cubes.Size());
        for (size_t other = 0; other < cubes.Size(); ++other) {
            if (other != index && isKept[other] != 0 &&
                Contains(cubes.At(index), cubes.At(other), space.NumWords())) {
                isKept[other] = 0;
                isOpen[other] = 0;
            }
        }
    }
    cubes.Keep(isKept);
    size_t numKept = 0;
    for (size_t index = 0; index < isKept.size(); ++index)
        if (isKept[index] != 0)
            cover.isPrime[numKept++] = cover.isPrime[index];
    cover.isPrime.resize(numKept);
}

} // namespace booleq
