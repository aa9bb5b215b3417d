// Blocking sets, signatures, and primes as complements of minimal hitting sets.
#include "blocking.h"

#include <algorithm>
#include <numeric>

namespace booleq {

namespace {

// Drops sets that contain another one.
void KeepMinimal(CubeList& sets, Work& work)
{
    sets.SortAndUnite();
    const size_t numWords = sets.NumWords();
    std::vector<uint32_t> sizes(sets.Size());
    for (size_t index = 0; index < sets.Size(); ++index)
        for (size_t word = 0; word < numWords; ++word)
            sizes[index] += static_cast<uint32_t>(CountBits(sets.At(index)[word]));
    std::vector<uint32_t> order(sets.Size());
    std::iota(order.begin(), order.end(), 0u);
    std::stable_sort(order.begin(), order.end(),
                     [&](uint32_t left, uint32_t right) { return sizes[left] < sizes[right]; });
    CubeList minimal(numWords);
    for (const uint32_t index : order) {
        bool isMinimal = true;
        for (size_t other = 0; other < minimal.Size() && isMinimal; ++other)
            isMinimal = !Contains(sets.At(index), minimal.At(other), numWords);
        work.Spend(minimal.Size() + 1);
        if (isMinimal)
            minimal.Append(sets.At(index));
    }
    sets = minimal;
}

// Adds the parts each of which alone keeps 'cube' from a cube of the block.  Requires: 'cube' meets
// none of the block.
void AddSingles(const CubeColumns& cubes, size_t block, const ColumnsToMeet& toMeet,
                uint64_t* singles)
{
    const uint64_t* const columns = cubes.Block(block);
    const uint64_t noOutput = ~AnyColumn(columns, toMeet.outputs);
    uint64_t one = noOutput;
    uint64_t two = 0;
    for (const uint32_t part : toMeet.inputs) {
        two |= one & ~columns[part];
        one |= ~columns[part];
    }
    assert((cubes.Cubes(block) & ~one) == 0);
    const uint64_t near = cubes.Cubes(block) & ~two;
    if (near == 0)
        return;
    for (const uint32_t part : toMeet.inputs)
        if ((near & ~columns[part]) != 0)
            SetBit(singles, part ^ 1u); // the other part of the pair
    for (size_t part = cubes.NumInputParts(); part < cubes.NumParts(); ++part)
        if ((near & noOutput & columns[part]) != 0)
            SetBit(singles, part);
}

// The sets of one off cube, without those that have a part of 'singles'. There is one for each of
// its outputs if no output is common, otherwise one.
void AppendSets(const CubeSpace& space, const uint64_t* off, const uint64_t* cube,
                const std::vector<uint64_t>& singles, CubeList& sets)
{
    const size_t numWords = space.NumWords();
    std::vector<uint64_t> set(numWords);
    uint64_t isKnown = 0;
    for (size_t word = 0; word < numWords; ++word) {
        set[word] = off[word] & InputConflicts(space, off, cube, word) * 3;
        isKnown |= set[word] & singles[word];
    }
    if (isKnown != 0)
        return;
    if (HasCommonOutput(space, off, cube)) {
        sets.Append(set.data());
        return;
    }
    for (size_t word = space.FirstOutputWord(); word < numWords; ++word) {
        uint64_t rest = off[word] & space.Outputs(word) & ~singles[word];
        for (; rest != 0; rest &= rest - 1) {
            sets.Append(set.data());
            SetBit(sets.At(sets.Size() - 1), 64 * word + LowestBit(rest));
        }
    }
}

} // namespace

CubeList FindBlockingSets(const CubeSpace& space, const CubeIndex& off, const uint64_t* cube,
                          Work& work)
{
    const size_t numWords = space.NumWords();
    const CubeColumns& columns = off.Columns();
    CubeList sets(numWords);
    ColumnsToMeet toMeet;
    if (!ListColumns(space, cube, toMeet))
        return sets;
    work.Spend(columns.NumBlocks() * (toMeet.inputs.size() + toMeet.outputs.size() + 1));
    // Sets of one part come from off cubes that are one part away. A set that contains one of these
    // parts says nothing new.
    std::vector<uint64_t> singles(numWords);
    for (size_t block = 0; block < columns.NumBlocks(); ++block)
        AddSingles(columns, block, toMeet, singles.data());
    for (size_t word = 0; word < numWords; ++word) {
        for (uint64_t rest = singles[word]; rest != 0; rest &= rest - 1) {
            sets.Resize(sets.Size() + 1);
            SetBit(sets.At(sets.Size() - 1), 64 * word + LowestBit(rest));
        }
    }
    std::vector<uint32_t> others;
    for (size_t block = 0; block < columns.NumBlocks(); ++block) {
        uint64_t open = columns.Cubes(block);
        for (size_t place = 0; place < toMeet.inputs.size() && open != 0; ++place)
            if (GetBit(singles.data(), toMeet.inputs[place] ^ 1u))
                open &= columns.Block(block)[toMeet.inputs[place]];
        AppendBits(open, block, others);
    }
    for (const uint32_t index : others)
        AppendSets(space, off.Cubes().At(index), cube, singles, sets);
    work.Spend(others.size() * numWords);
    KeepMinimal(sets, work);
    return sets;
}

void FindSignature(const CubeSpace& space, const CubeList& blocking, uint64_t* signature)
{
    for (size_t word = 0; word < space.NumWords(); ++word) {
        signature[word] = space.All(word);
        for (size_t index = 0; index < blocking.Size(); ++index)
            signature[word] &= ~blocking.At(index)[word];
    }
}

namespace {

class HittingSearch {
  public:
    HittingSearch(const CubeSpace& space, const CubeList& blocking, size_t maxCount, Work& work,
                  CubeList& primes)
        : m_space(space), m_blocking(blocking), m_work(work), m_primes(primes),
          m_max_size(primes.Size() + maxCount), m_num_row_words((blocking.Size() + 63) / 64),
          m_candidates(space.NumWords()), m_chosen(space.NumWords()),
          m_rows_of(64 * space.NumWords())
    {
    }

    bool Run(const uint64_t* parts)
    {
        Rows uncovered(m_num_row_words);
        for (size_t row = 0; row < m_blocking.Size(); ++row) {
            bool isOpen = true; // no part that counts as chosen meets it
            for (size_t word = 0; word < m_space.NumWords(); ++word)
                isOpen = isOpen && (m_blocking.At(row)[word] & ~parts[word]) == 0;
            if (!isOpen)
                continue;
            SetBit(uncovered.data(), row);
            for (size_t word = 0; word < m_space.NumWords(); ++word) {
                m_candidates[word] |= m_blocking.At(row)[word];
                for (uint64_t rest = m_blocking.At(row)[word]; rest != 0; rest &= rest - 1) {
                    Rows& rows = m_rows_of[64 * word + LowestBit(rest)];
                    rows.resize(m_num_row_words);
                    SetBit(rows.data(), row);
                }
            }
        }
        for (size_t word = 0; word < m_space.NumWords(); ++word)
            m_parts.push_back(parts[word]);
        return Find(uncovered);
    }

  private:
    typedef std::vector<uint64_t> Rows;

    // Invariant: for each chosen part there is a row that only this part meets (m_critical).
    bool Find(const Rows& uncovered)
    {
        m_work.Spend(m_num_row_words * (m_critical.size() + 1) + 1);
        size_t row = SIZE_MAX;
        if (!ChooseRow(uncovered, row))
            return AddPrime();
        std::vector<size_t> parts;
        for (size_t word = 0; word < m_space.NumWords(); ++word) {
            uint64_t common = m_blocking.At(row)[word] & m_candidates[word];
            m_candidates[word] &= ~common;
            for (; common != 0; common &= common - 1)
                parts.push_back(64 * word + LowestBit(common));
        }
        bool isAll = true;
        for (const size_t part : parts) {
            isAll = isAll && Choose(part, uncovered);
            SetBit(m_candidates.data(), part);
        }
        return isAll;
    }

    bool Choose(size_t part, const Rows& uncovered)
    {
        const Rows& rows = m_rows_of[part];
        Rows rest(m_num_row_words);
        Rows own(m_num_row_words);
        for (size_t word = 0; word < m_num_row_words; ++word) {
            rest[word] = uncovered[word] & ~rows[word];
            own[word] = uncovered[word] & rows[word];
        }
        m_work.Spend(m_num_row_words * (m_critical.size() + 1));
        std::vector<Rows> saved = m_critical;
        bool isMinimal = true;
        for (Rows& critical : m_critical) {
            uint64_t any = 0;
            for (size_t word = 0; word < m_num_row_words; ++word)
                any |= critical[word] &= ~rows[word];
            isMinimal = isMinimal && any != 0;
        }
        bool isAll = true;
        if (isMinimal) {
            m_critical.push_back(std::move(own));
            SetBit(m_chosen.data(), part);
            isAll = Find(rest);
            ClearBit(m_chosen.data(), part);
        }
        m_critical.swap(saved);
        return isAll;
    }

    // The uncovered row with the fewest candidates. False if there is none.
    bool ChooseRow(const Rows& uncovered, size_t& best) const
    {
        size_t fewest = SIZE_MAX;
        for (size_t word = 0; word < m_num_row_words; ++word) {
            for (uint64_t rest = uncovered[word]; rest != 0; rest &= rest - 1) {
                const size_t row = 64 * word + LowestBit(rest);
                size_t count = 0;
                for (size_t part = 0; part < m_space.NumWords(); ++part)
                    count += CountBits(m_blocking.At(row)[part] & m_candidates[part]);
                if (count < fewest) {
                    fewest = count;
                    best = row;
                }
                if (fewest <= 1)
                    return true;
            }
        }
        return fewest != SIZE_MAX;
    }

    bool AddPrime()
    {
        if (m_primes.Size() >= m_max_size)
            return false;
        m_primes.Resize(m_primes.Size() + 1);
        uint64_t* prime = m_primes.At(m_primes.Size() - 1);
        for (size_t word = 0; word < m_space.NumWords(); ++word)
            prime[word] = m_parts[word] & ~m_chosen[word];
        assert(HasCommonInputs(m_space, prime, prime));
        assert(HasCommonOutput(m_space, prime, prime));
        return true;
    }

    const CubeSpace& m_space;
    const CubeList& m_blocking;
    Work& m_work;
    CubeList& m_primes;
    size_t m_max_size;
    size_t m_num_row_words;
    std::vector<uint64_t> m_candidates; // parts that may still be chosen
    std::vector<uint64_t> m_chosen;
    std::vector<uint64_t> m_parts;
    std::vector<Rows> m_rows_of;  // of each part
    std::vector<Rows> m_critical; // of each chosen part
};

} // namespace

bool FindPrimes(const CubeSpace& space, const CubeList& blocking, const uint64_t* parts,
                size_t maxCount, Work& work, CubeList& primes)
{
    assert(primes.NumWords() == space.NumWords());
    return HittingSearch(space, blocking, maxCount, work, primes).Run(parts);
}

} // namespace booleq
