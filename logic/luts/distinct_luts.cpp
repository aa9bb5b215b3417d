#include "distinct_luts.h"

#include <algorithm>
#include <cassert>
#include <numeric>
#include <vector>

#include "lut_word.h"
#include "watch.h"

namespace booleq {

namespace {

// Calls Watch() once in 65536 steps.
void WatchAt(size_t step)
{
    if (step % 65536 == 0)
        Watch();
}

// Tables met so far, found by their hash: open addressing, at most half full. A slot holds a place
// among the distinct tables plus one; 0 is a free slot.
template <class Word>
class Meeting {
  public:
    Meeting() : m_slots(1024) {}

    size_t Meet(Word word, uint64_t place)
    {
        size_t slot = SlotOf(word);
        while (m_slots[slot] != 0 && m_words[m_slots[slot] - 1] != word)
            slot = (slot + 1) & (m_slots.size() - 1);
        if (m_slots[slot] == 0) {
            m_words.push_back(word);
            m_first_places.push_back(place);
            m_counts.push_back(0);
            m_slots[slot] = m_words.size();
            if (2 * m_words.size() > m_slots.size())
                Grow();
            ++m_counts.back();
            return m_words.size() - 1;
        }
        ++m_counts[m_slots[slot] - 1];
        return m_slots[slot] - 1;
    }

    const std::vector<Word>& Words() const { return m_words; }
    uint64_t FirstPlace(size_t distinct) const { return m_first_places[distinct]; }
    uint64_t Count(size_t distinct) const { return m_counts[distinct]; }

  private:
    // Multiplying by an odd constant near 2^64 divided by the golden ratio mixes the upper bits.
    size_t SlotOf(Word word) const
    {
        constexpr uint64_t kMix = 0x9e3779b97f4a7c15;
        uint64_t hash = LutWord<Word>::Upper(word) * kMix;
        hash = (hash ^ (hash >> 32) ^ LutWord<Word>::Lower(word)) * kMix;
        hash = (hash ^ (hash >> 29)) * kMix;
        return static_cast<size_t>(hash >> 20) & (m_slots.size() - 1);
    }

    void Grow()
    {
        m_slots.assign(4 * m_slots.size(), 0);
        for (size_t distinct = 0; distinct < m_words.size(); ++distinct) {
            WatchAt(distinct);
            size_t slot = SlotOf(m_words[distinct]);
            while (m_slots[slot] != 0)
                slot = (slot + 1) & (m_slots.size() - 1);
            m_slots[slot] = distinct + 1;
        }
    }

    std::vector<size_t> m_slots; // their number is a power of two
    std::vector<Word> m_words;
    std::vector<uint64_t> m_first_places;
    std::vector<uint64_t> m_counts;
};

// The places of the words, in ascending order of the words.
template <class Word>
std::vector<size_t> SortedPlaces(const std::vector<Word>& words)
{
    struct Element {
        Word word;
        size_t place;
    };
    std::vector<Element> elements;
    elements.reserve(words.size());
    for (const Word word : words)
        elements.push_back({word, elements.size()});
    size_t numCompared = 0;
    std::sort(elements.begin(), elements.end(), [&](const Element& left, const Element& right) {
        WatchAt(numCompared++);
        return left.word < right.word;
    });
    std::vector<size_t> places;
    places.reserve(words.size());
    for (const Element& element : elements)
        places.push_back(element.place);
    return places;
}

template <class Word>
DistinctLuts FindDistinct(const Word* tables, size_t count, bool isTwo, uint64_t* distinctPlaces)
{
    Meeting<Word> meeting;
    for (size_t place = 0; place < count; ++place) {
        WatchAt(place);
        const size_t distinct = meeting.Meet(tables[place], place);
        if (distinctPlaces != nullptr)
            distinctPlaces[place] = distinct;
    }
    const std::vector<Word>& words = meeting.Words();
    const std::vector<size_t> sorted = SortedPlaces(words);
    DistinctLuts result;
    std::vector<uint64_t> placeOf(words.size());
    for (size_t place = 0; place < sorted.size(); ++place) {
        WatchAt(place);
        const size_t distinct = sorted[place];
        placeOf[distinct] = place;
        result.words.push_back(LutWord<Word>::Lower(words[distinct]));
        if (isTwo)
            result.words.push_back(LutWord<Word>::Upper(words[distinct]));
        result.firstPlaces.push_back(meeting.FirstPlace(distinct));
        result.counts.push_back(meeting.Count(distinct));
    }
    for (size_t place = 0; distinctPlaces != nullptr && place < count; ++place) {
        WatchAt(place);
        distinctPlaces[place] = placeOf[static_cast<size_t>(distinctPlaces[place])];
    }
    assert(std::accumulate(result.counts.begin(), result.counts.end(), uint64_t(0)) == count);
    return result;
}

} // namespace

DistinctLuts FindDistinctLuts(const LutArray& luts, uint64_t* distinctPlaces)
{
    DistinctLuts result;
    WithLutWord(luts, [&](auto zero) {
        typedef decltype(zero) Word;
        result = FindDistinct(static_cast<const Word*>(luts.tables), luts.count,
                              luts.tableBytes == 16, distinctPlaces);
    });
    return result;
}

} // namespace booleq
