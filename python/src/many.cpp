// Equations by the thousand. Texts are read on all processors, each once, to check that they are
// accepted. The Python objects hold the texts but no trees, and equal texts share an object.
#include <algorithm>
#include <atomic>
#include <cassert>
#include <cstring>
#include <functional>
#include <memory>
#include <string>
#include <string_view>
#include <vector>

#include "bind.h"
#include "errors.h"
#include "lock.h"
#include "lut_word.h"
#include "messages.h"
#include "parallel.h"
#include "text.h"
#include "unicode.h"

namespace booleq_python {

namespace {

constexpr size_t kPart = 2048; // texts that a thread takes at a time
constexpr size_t kNowhere = booleq::kNoLut;

// Remembers where something was seen recently, by its hash. A new entry replaces an older one when
// its places are full.  Threads: any at any time.
class Recent {
  public:
    explicit Recent(size_t size)
    {
        size_t numEntries = 64;
        while (numEntries < std::min(size, kMaxEntries))
            numEntries *= 2;
        m_mask = numEntries - 1;
        m_entries = std::make_unique<std::atomic<uint64_t>[]>(numEntries);
        for (size_t entry = 0; entry < numEntries; ++entry)
            m_entries[entry].store(0, std::memory_order_relaxed);
    }

    // The place of an entry for which 'isSame' is true, or kNowhere.
    template <class IsSame>
    size_t Find(uint64_t hash, const IsSame& isSame) const
    {
        for (size_t way = 0; way < kWays; ++way) {
            const uint64_t entry = m_entries[(hash & m_mask) ^ way].load(std::memory_order_relaxed);
            const size_t place = static_cast<size_t>(entry & kPlaces) - 1;
            if (entry != 0 && ((entry ^ hash) & ~kPlaces) == 0 && isSame(place))
                return place;
        }
        return kNowhere;
    }

    void Put(uint64_t hash, size_t place)
    {
        size_t way = 0;
        while (way < kWays && m_entries[(hash & m_mask) ^ way].load(std::memory_order_relaxed) != 0)
            ++way;
        m_entries[(hash & m_mask) ^ (way % kWays)].store((hash & ~kPlaces) | (place + 1),
                                                         std::memory_order_relaxed);
    }

  private:
    static constexpr size_t kWays = 4;                     // entries where something may be
    static constexpr size_t kMaxEntries = size_t(1) << 16; // these stay in a processor's cache
    static constexpr uint64_t kPlaces = (uint64_t(1) << 48) - 1; // part of the hash is above

    size_t m_mask;
    std::unique_ptr<std::atomic<uint64_t>[]> m_entries;
};

// Texts as the library reads them. ASCII texts are used in place, in Python's memory.
class Texts {
  public:
    explicit Texts(const py::object& texts)
    {
        if (PyUnicode_Check(texts.ptr()))
            throw py::type_error("texts must be an iterable of texts, not a str");
        const auto fast = py::reinterpret_steal<py::object>(
            PySequence_Fast(texts.ptr(), "texts must be an iterable of texts"));
        if (!fast)
            throw py::error_already_set();
        // A copy of the list: the caller's may change while the lock is released.
        m_objects = py::reinterpret_steal<py::object>(PySequence_List(fast.ptr()));
        if (!m_objects)
            throw py::error_already_set();
        const size_t size = Size();
        m_bytes.reserve(size);
        for (size_t place = 0; place < size; ++place) {
            Add(At(place), place);
            if (place % kPart == 0)
                CheckSignals();
        }
    }

    size_t Size() const { return static_cast<size_t>(PyList_GET_SIZE(m_objects.ptr())); }
    py::handle At(size_t place) const
    {
        return PyList_GET_ITEM(m_objects.ptr(), static_cast<Py_ssize_t>(place));
    }
    // A zero byte follows the bytes.
    std::string_view Bytes(size_t place) const { return m_bytes[place]; }
    bool HasLarge() const { return m_has_large; }

  private:
    void Add(py::handle text, size_t place)
    {
        if (!PyUnicode_CheckExact(text.ptr())) {
            const std::string what = "texts[" + std::to_string(place) + "]";
            py::str plain = RequireStr(py::reinterpret_borrow<py::object>(text), what.c_str());
            PyList_SetItem(m_objects.ptr(), static_cast<Py_ssize_t>(place), plain.release().ptr());
            text = At(place);
        }
        if (PyUnicode_IS_COMPACT_ASCII(text.ptr())) {
            m_bytes.emplace_back(static_cast<const char*>(PyUnicode_DATA(text.ptr())),
                                 static_cast<size_t>(PyUnicode_GET_LENGTH(text.ptr())));
        } else {
            m_encoded.push_back(
                std::make_unique<std::string>(Encode(py::reinterpret_borrow<py::str>(text))));
            m_bytes.emplace_back(*m_encoded.back());
        }
        m_has_large = m_has_large || m_bytes.back().size() > kLargeText;
    }

    py::object m_objects; // owns the bytes of the ASCII texts
    std::vector<std::unique_ptr<std::string>> m_encoded;
    std::vector<std::string_view> m_bytes;
    bool m_has_large = false;
};

// What was found about the texts, without the interpreter's lock.
struct Found {
    size_t refused = kNowhere;           // the first refused one
    std::vector<size_t> sources;         // for each, the place of an equal one that was read
    std::vector<SharedContent> contents; // of the large texts; empty if there are none
};

// Reads texts one after another into the same object.
class Reader {
  public:
    explicit Reader(const booleq::Reading& reading)
        : m_reading(reading), m_terms(booleq::TermsOf(reading))
    {
    }

    bool Read(std::string_view text, Kq_BoolEquation& equation) const
    {
        if (text.find('\0') != std::string_view::npos)
            return false;
        if (m_reading.hasInputs)
            return booleq::SetOverTerms(equation, std::string(text), m_reading, m_terms);
        equation.Clear(); // over the variables of the previous text this one might be an init value
        return equation.SetEquation(text.data());
    }

  private:
    const booleq::Reading& m_reading;
    std::vector<Port::StringBase<char>> m_terms;
};

Found ReadAll(const Texts& texts, const booleq::Reading& reading)
{
    const size_t size = texts.Size();
    const Reader reader(reading);
    Recent recent(size);
    Found found;
    found.sources.resize(size);
    found.contents.resize(texts.HasLarge() ? size : 0);
    const auto readPart = [&](size_t begin, size_t end) {
        const booleq::NoMessages silence;
        Kq_BoolEquation equation;
        for (size_t place = begin; place < end; ++place) {
            const std::string_view text = texts.Bytes(place);
            const uint64_t hash = std::hash<std::string_view>()(text);
            found.sources[place] =
                recent.Find(hash, [&](size_t other) { return texts.Bytes(other) == text; });
            if (found.sources[place] != kNowhere)
                continue;
            if (!reader.Read(text, equation))
                return place;
            found.sources[place] = place;
            if (text.size() > kLargeText)
                found.contents[place] = std::make_shared<Content>(Content{equation});
            recent.Put(hash, place);
        }
        return end;
    };
    found.refused = booleq::FindFirstInParts(size, kPart, booleq::LutWork(), readPart);
    return found;
}

// A list with an object for each place, which is the one of its source.
template <class Make>
py::list GiveAll(size_t size, const std::vector<size_t>& sources, const Make& make)
{
    py::list given(size);
    const auto put = [&](size_t place, const py::object& object) {
        PyList_SET_ITEM(given.ptr(), static_cast<Py_ssize_t>(place), object.inc_ref().ptr());
    };
    for (size_t place = 0; place < size; ++place) {
        if (place % kPart == 0)
            CheckSignals();
        if (PyList_GET_ITEM(given.ptr(), static_cast<Py_ssize_t>(place)))
            continue;
        const size_t source = sources[place];
        if (source != place && !PyList_GET_ITEM(given.ptr(), static_cast<Py_ssize_t>(source)))
            put(source, make(source));
        put(place, source == place ? make(place) : py::object(given[source]));
    }
    return given;
}

py::list Equations(const py::object& texts, const py::object& inputs, const py::object& lsbFirst)
{
    const py::object given = inputs.is_none() ? inputs : RequireInputs(inputs);
    const bool isLsbFirst = RequireFlag(lsbFirst, "lsb_first");
    const booleq::Reading reading = ReadingOf(given, isLsbFirst);
    const Texts all(texts);
    Found found = FreelyIf(all.Size() > kPart / 16, [&] { return ReadAll(all, reading); });
    if (found.refused == kNowhere)
        return GiveAll(all.Size(), found.sources, [&](size_t place) {
            return Wrap({found.contents.empty() ? nullptr : std::move(found.contents[place]),
                         py::reinterpret_borrow<py::object>(all.At(place)), given, isLsbFirst});
        });
    const auto text = py::reinterpret_borrow<py::str>(all.At(found.refused));
    try {
        RaiseParseError(text, Encode(text), reading);
    } catch (py::error_already_set& error) {
        error.value().attr("add_note")("it is texts[" + std::to_string(found.refused) + "]");
        throw;
    }
}

// The init value of a table of 'numInputs' inputs.
py::object TextOf(const uint64_t* words, unsigned int numInputs)
{
    const unsigned int rowsPerDigit = numInputs == 1 ? 1 : 4;
    const size_t numDigits = (size_t(1) << numInputs) / rowsPerDigit;
    auto text = py::reinterpret_steal<py::object>(
        PyUnicode_New(static_cast<Py_ssize_t>(2 + numDigits), 127));
    if (!text)
        throw py::error_already_set();
    auto* digit = static_cast<uint8_t*>(PyUnicode_DATA(text.ptr()));
    *digit++ = '0';
    *digit++ = numInputs == 1 ? 'b' : 'x';
    for (size_t row = numDigits * rowsPerDigit; row > 0; ++digit) {
        row -= rowsPerDigit;
        const uint64_t rows = words[row / 64] >> (row % 64);
        *digit = static_cast<uint8_t>("0123456789abcdef"[rows & ((1u << rowsPerDigit) - 1)]);
    }
    return text;
}

// Each row of 'words' is a function over the inputs: words of 64 rows, with row k in bit k % 64 of
// word k / 64.
py::list FromWords(const py::buffer& words, const py::object& inputs)
{
    const py::tuple given = RequireInputs(inputs);
    const auto numInputs = static_cast<unsigned int>(given.size());
    const py::buffer_info info = words.request();
    const size_t numWords = booleq::NumWords(numInputs);
    assert(info.ndim == 2 && info.itemsize == 8 && info.strides[1] == 8);
    if (static_cast<size_t>(info.shape[1]) != numWords)
        throw py::value_error("words of another number of inputs");
    const auto size = static_cast<size_t>(info.shape[0]);
    const auto* const tables = static_cast<const uint64_t*>(info.ptr);
    assert(size == 0 || info.strides[0] == static_cast<py::ssize_t>(numWords * 8));

    Recent recent(size);
    std::vector<size_t> sources(size);
    for (size_t place = 0; place < size; ++place) {
        const uint64_t* const own = tables + place * numWords;
        const uint64_t hash = (own[0] ^ own[numWords - 1] * 3) * 0x9e3779b97f4a7c15;
        sources[place] = recent.Find(hash ^ hash >> 32, [&](size_t other) {
            return std::equal(own, own + numWords, tables + other * numWords);
        });
        if (sources[place] == kNowhere) {
            sources[place] = place;
            recent.Put(hash ^ hash >> 32, place);
        }
    }
    // With a split name the library reads the expression that the digits stand for.
    const bool arePlain = booleq::FirstSplitName(EncodeAll(given)).empty();
    return GiveAll(size, sources, [&](size_t place) {
        py::object text = TextOf(tables + place * numWords, numInputs);
        if (arePlain)
            return Wrap({nullptr, std::move(text), given, false});
        return ReadEquation(py::reinterpret_borrow<py::str>(text), given, false);
    });
}

} // namespace

void BindMany(py::module_& module)
{
    module.def("equations", &Equations);
    module.def("from_words", &FromWords);
}

} // namespace booleq_python
