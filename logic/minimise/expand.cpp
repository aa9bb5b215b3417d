// EXPAND: growth of one cube against the off-set, and of a cover cube by cube.
#include "expand.h"

#include <algorithm>
#include <numeric>

#include "unate.h"

namespace booleq {

namespace {

// Limit of candidates asked at a time, times the blocks of off cubes that each is checked against.
constexpr size_t kMaxAskedBlocks = size_t(1) << 18;
constexpr size_t kManyCandidates = 16384; // with more than these, an eighth of that

} // namespace

OpenCubes::OpenCubes(const CubeSpace& space, const CubeList& cubes, bool areOpen)
    : m_cubes(cubes), m_columns(space, cubes), m_open(m_columns.NumBlocks())
{
    for (size_t block = 0; block < m_open.size() && areOpen; ++block)
        m_open[block] = m_columns.Cubes(block);
}

Expander::Expander(const TwoLevelProblem& problem, Work& work)
    : m_problem(problem), m_space(problem.space), m_work(work), m_num_words(m_space.NumWords()),
      m_raised(m_num_words), m_free(m_num_words), m_scratch(m_num_words),
      m_obstacles(m_space, problem.off, work), m_none(m_num_words),
      m_on_index(m_space, problem.hasOff ? m_none : problem.on),
      m_free_index(m_space, problem.hasOff ? m_none : problem.free),
      m_known(m_space, m_on_index, m_free_index, work)
{
}

bool Expander::IsImplicant(const uint64_t* cube)
{
    if (!m_problem.hasOff)
        return m_known.Cover(cube, SIZE_MAX);
    return !m_obstacles.IsMet(cube);
}

void Expander::Expand(uint64_t* cube, const uint64_t* allowed, const OpenCubes& others)
{
    for (size_t word = 0; word < m_num_words; ++word) {
        m_raised[word] = cube[word];
        m_free[word] = m_space.All(word) & ~cube[word] & (allowed ? allowed[word] : ~uint64_t(0));
    }
    if (!m_problem.hasOff) {
        ListCandidates(others);
        ExpandByTautology(cube, others.Cubes());
        return;
    }
    m_obstacles.Start(m_raised.data(), m_free.data());
    Settle();
    ListCandidates(others);
    CoverOthers(others);
    while (!m_obstacles.IsNoneActive())
        RaiseLeastBlocked();
    for (size_t word = 0; word < m_num_words; ++word)
        cube[word] = m_raised[word] | m_free[word];
    assert(IsImplicant(cube));
}

// The open cubes that lie in m_raised and m_free.
void Expander::ListCandidates(const OpenCubes& others)
{
    const CubeColumns& columns = others.Columns();
    std::vector<uint32_t> parts; // parts that keep a cube out
    for (size_t word = 0; word < m_num_words; ++word)
        AppendBits(m_space.All(word) & ~(m_raised[word] | m_free[word]), word, parts);
    m_work.Spend(columns.NumBlocks() * (parts.size() + 1) / 2);
    m_candidates.clear();
    for (size_t block = 0; block < columns.NumBlocks(); ++block)
        if (others.Open(block) != 0)
            AppendBits(others.Open(block) & ~AnyColumn(columns.Block(block), parts), block,
                       m_candidates);
    m_feasible.assign(columns.NumBlocks(), 0);
}

// Takes in the others one by one as long as any is feasible; then grows towards the rest.
void Expander::CoverOthers(const OpenCubes& others)
{
    for (;;) {
        const size_t numFeasible = FilterCandidates(others.Cubes());
        if (m_candidates.empty() || m_obstacles.IsNoneActive())
            return;
        if (numFeasible > 0)
            RaiseBest(others, numFeasible);
        else
            RaiseMostFrequent(others.Cubes());
    }
}

// Keeps the candidates that lie in m_raised and m_free together but not in m_raised alone, feasible
// ones first, and returns the number of feasible ones.
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
    const size_t maxBlocks = numKept > kManyCandidates ? kMaxAskedBlocks / 8 : kMaxAskedBlocks;
    const size_t numAsked = std::min(numKept, maxBlocks / (m_problem.off.Size() / 64 + 1) + 16);
    if (numKept > numAsked) { // the nearest are asked now, the others after the cube has grown
        const auto isNearer = [&](uint32_t left, uint32_t right) {
            const size_t leftCount = CountRaised(others.At(left));
            const size_t rightCount = CountRaised(others.At(right));
            return leftCount != rightCount ? leftCount < rightCount : left < right;
        };
        std::nth_element(m_candidates.begin(),
                         m_candidates.begin() + static_cast<std::ptrdiff_t>(numAsked),
                         m_candidates.end(), isNearer);
    }
    size_t numFeasible = 0;
    for (size_t place = 0; place < numAsked; ++place)
        if (m_obstacles.IsFeasible(m_free.data(), others.At(m_candidates[place])))
            std::swap(m_candidates[place], m_candidates[numFeasible++]);
    return numFeasible;
}

// The number of parts that 'cube' would raise.
size_t Expander::CountRaised(const uint64_t* cube) const
{
    size_t count = 0;
    for (size_t word = 0; word < m_num_words; ++word)
        count += CountBits(cube[word] & ~m_raised[word]);
    return count;
}

// The number of candidates that could still be taken in, judged by the parts lowered at once.
size_t Expander::CountAfter(const OpenCubes& others, size_t numFeasible, const uint64_t* with)
{
    for (size_t word = 0; word < m_num_words; ++word)
        m_scratch[word] = m_raised[word] | m_free[word];
    m_obstacles.ClearLowered(m_free.data(), with, m_scratch.data());
    std::vector<uint32_t>& lost = m_lost;
    lost.clear();
    for (size_t word = 0; word < m_num_words; ++word)
        AppendBits((m_raised[word] | m_free[word]) & ~m_scratch[word], word, lost);
    if (lost.empty())
        return numFeasible;
    m_work.Spend(uint64_t(m_feasible_blocks.size()) * lost.size() / 2);
    size_t count = 0;
    for (const uint32_t block : m_feasible_blocks)
        count += CountBits(m_feasible[block] & ~AnyColumn(others.Columns().Block(block), lost));
    return count;
}

// Takes in the feasible candidate after which most others can be taken in; of equal ones the one
// that raises the fewest parts.
void Expander::RaiseBest(const OpenCubes& others, size_t numFeasible)
{
    std::fill(m_feasible.begin(), m_feasible.end(), 0);
    m_feasible_blocks.clear();
    for (size_t place = 0; place < numFeasible; ++place) {
        const uint32_t candidate = m_candidates[place];
        if (m_feasible[candidate / 64] == 0)
            m_feasible_blocks.push_back(candidate / 64);
        SetBit(m_feasible.data(), candidate);
    }
    size_t best = 0;
    size_t bestCount = 0;
    size_t bestRaised = SIZE_MAX;
    for (size_t place = 0; place < numFeasible && numFeasible > 1; ++place) {
        const uint64_t* cube = others.Cubes().At(m_candidates[place]);
        const size_t count = CountAfter(others, numFeasible, cube);
        const size_t numRaised = CountRaised(cube);
        if (count > bestCount || (count == bestCount && numRaised < bestRaised)) {
            best = place;
            bestCount = count;
            bestRaised = numRaised;
        }
    }
    const uint64_t* cube = others.Cubes().At(m_candidates[best]);
    for (size_t word = 0; word < m_num_words; ++word) {
        m_raised[word] |= cube[word];
        m_free[word] &= ~cube[word];
    }
    Settle();
}

void Expander::Settle()
{
    m_obstacles.Settle(m_raised.data(), m_free.data());
}

void Expander::Raise(size_t bit)
{
    assert(GetBit(m_free.data(), bit));
    SetBit(m_raised.data(), bit);
    ClearBit(m_free.data(), bit);
    Settle();
}

// Raises the free part that the most candidates have.
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

// Raises the free part that the fewest active cubes have.
void Expander::RaiseLeastBlocked()
{
    m_obstacles.CountFree(m_free.data(), m_counts);
    size_t best = SIZE_MAX;
    for (size_t bit = 0; bit < m_counts.size(); ++bit)
        if (GetBit(m_free.data(), bit) && (best == SIZE_MAX || m_counts[bit] < m_counts[best]))
            best = bit;
    assert(best != SIZE_MAX); // an active cube needs free parts
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

void KeepInCover(Cover& cover, const std::vector<uint8_t>& isKept)
{
    cover.cubes.Keep(isKept);
    size_t numKept = 0;
    for (size_t index = 0; index < isKept.size(); ++index)
        if (isKept[index] != 0)
            cover.isPrime[numKept++] = cover.isPrime[index];
    cover.isPrime.resize(numKept);
}

namespace {

// A prime lies in another prime only if they are equal.
void DropEqualPrimes(Cover& cover)
{
    const CubeList& cubes = cover.cubes;
    const size_t numWords = cubes.NumWords();
    std::vector<uint32_t> order(cubes.Size());
    std::iota(order.begin(), order.end(), 0u);
    std::stable_sort(order.begin(), order.end(), [&](uint32_t left, uint32_t right) {
        return std::lexicographical_compare(cubes.At(left), cubes.At(left) + numWords,
                                            cubes.At(right), cubes.At(right) + numWords);
    });
    std::vector<uint8_t> isKept(cubes.Size(), 1);
    for (size_t place = 1; place < order.size(); ++place)
        if (IsSameCube(cubes.At(order[place - 1]), cubes.At(order[place]), numWords))
            isKept[order[place - 1]] = 0;
    KeepInCover(cover, isKept);
}

// Closes the open cubes that lie in 'prime', and clears their flags.
void TakeIn(const CubeSpace& space, const uint64_t* prime, OpenCubes& others,
            std::vector<uint8_t>& isKept, Work& work)
{
    std::vector<uint32_t> parts; // parts that keep a cube out
    for (size_t word = 0; word < space.NumWords(); ++word)
        AppendBits(space.All(word) & ~prime[word], word, parts);
    const CubeColumns& columns = others.Columns();
    work.Spend(columns.NumBlocks() * (parts.size() + 1) / 2);
    std::vector<uint32_t> taken;
    for (size_t block = 0; block < columns.NumBlocks(); ++block)
        if (others.Open(block) != 0)
            AppendBits(others.Open(block) & ~AnyColumn(columns.Block(block), parts), block, taken);
    for (const uint32_t index : taken) {
        assert(Contains(prime, others.Cubes().At(index), space.NumWords()));
        others.Close(index);
        isKept[index] = 0;
    }
}

} // namespace

void ExpandCover(const CubeSpace& space, Expander& expander, Cover& cover, Work& work)
{
    CubeList& cubes = cover.cubes;
    std::vector<uint8_t> isKept(cubes.Size(), 1);
    OpenCubes others(space, cubes, true); // cubes that are yet to be expanded
    for (size_t index = 0; index < cubes.Size(); ++index)
        if (cover.isPrime[index] != 0)
            others.Close(index);
    const auto finish = [&] {
        KeepInCover(cover, isKept);
        DropEqualPrimes(cover);
    };
    try {
        for (const uint32_t index : OrderByWeight(space, cubes)) {
            if (!others.IsOpen(index))
                continue;
            others.Close(index);
            expander.Expand(cubes.At(index), nullptr, others);
            cover.isPrime[index] = 1;
            TakeIn(space, cubes.At(index), others, isKept, work);
        }
    } catch (const OutOfWork&) {
        finish(); // it is still a cover
        throw;
    }
    finish();
}

} // namespace booleq
