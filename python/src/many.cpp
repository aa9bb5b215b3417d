// Equations by the thousand: texts and init values are read on all processors, and become objects
// of Python in the end.
#include <algorithm>
#include <atomic>
#include <cassert>
#include <cstring>
#include <string>
#include <vector>

#include "bind.h"
#include "errors.h"
#include "lock.h"
#include "messages.h"
#include "parallel.h"
#include "text.h"
#include "unicode.h"

namespace booleq_python {

namespace {

constexpr size_t kPart = 2048; // equations that a thread takes at a time

typedef Port::StringBase<char> String;

// Texts as the library reads them. Those of letters that take a byte each are used where Python
// has them.
class Texts {
  public:
    explicit Texts(const py::object& texts)
    {
        if (PyUnicode_Check(texts.ptr()))
            throw py::type_error("texts must be an iterable of texts, not a str");
        m_objects = py::reinterpret_steal<py::object>(
            PySequence_Fast(texts.ptr(), "texts must be an iterable of texts"));
        if (!m_objects)
            throw py::error_already_set();
        const size_t size = Size();
        m_bytes.reserve(size);
        for (size_t place = 0; place < size; ++place)
            Add(At(place), place);
    }

    size_t Size() const { return static_cast<size_t>(PySequence_Fast_GET_SIZE(m_objects.ptr())); }
    py::handle At(size_t place) const
    {
        return PySequence_Fast_GET_ITEM(m_objects.ptr(), static_cast<Py_ssize_t>(place));
    }
    // Null for a text with a NUL inside.
    const char* Bytes(size_t place) const { return m_bytes[place]; }

  private:
    void Add(const py::handle& text, size_t place)
    {
        if (!PyUnicode_CheckExact(text.ptr()))
            throw py::type_error("texts[" + std::to_string(place) + "] must be a str, not " +
                                 TypeName(text));
        const char* bytes = nullptr;
        Py_ssize_t size = 0;
        if (PyUnicode_IS_COMPACT_ASCII(text.ptr())) {
            bytes = static_cast<const char*>(PyUnicode_DATA(text.ptr()));
            size = PyUnicode_GET_LENGTH(text.ptr());
        } else {
            m_encoded.push_back(
                std::make_unique<std::string>(Encode(py::reinterpret_borrow<py::str>(text))));
            bytes = m_encoded.back()->c_str();
            size = static_cast<Py_ssize_t>(m_encoded.back()->size());
        }
        m_bytes.push_back(std::strlen(bytes) == static_cast<size_t>(size) ? bytes : nullptr);
    }

    py::object m_objects; // holds the bytes
    std::vector<std::unique_ptr<std::string>> m_encoded;
    std::vector<const char*> m_bytes;
};

// What the library is given beside each text.
struct Terms {
    booleq::Reading reading;
    std::vector<String> names;
};

Terms TermsOf(const py::object& given, bool lsbFirst)
{
    Terms terms;
    terms.reading.inputsName = "inputs=";
    terms.reading.lsbFirst = lsbFirst;
    terms.reading.hasInputs = !given.is_none();
    if (terms.reading.hasInputs)
        terms.reading.inputs = EncodeAll(py::reinterpret_borrow<py::tuple>(given));
    for (const std::string& name : terms.reading.inputs)
        terms.names.push_back(String(name.c_str()));
    return terms;
}

bool Set(Kq_BoolEquation& equation, const char* text, const Terms& terms)
{
    if (!terms.reading.hasInputs)
        return equation.SetEquation(text);
    const std::string own = booleq::LibraryText(text, terms.reading);
    return equation.SetEquationWithExplicitTerms(terms.names, own.c_str(), terms.reading.lsbFirst,
                                                 false);
}

// Calls set(place, equation) for each; gives back the first place where it was false, or 'size'.
template <class SetOne>
size_t SetAll(size_t size, std::vector<SharedContent>& contents, const SetOne& set)
{
    contents.resize(size);
    std::atomic<size_t> refused{size};
    FreelyIf(size > kPart / 16, [&] {
        booleq::RunInParts(size, kPart, booleq::LutWork(), [&](size_t begin, size_t end) {
            const booleq::NoMessages silence;
            for (size_t place = begin; place < end; ++place) {
                const auto content = std::make_shared<Content>();
                if (set(place, content->equation)) {
                    contents[place] = content;
                    continue;
                }
                size_t known = refused;
                while (place < known && !refused.compare_exchange_weak(known, place)) {
                }
                return;
            }
        });
    });
    return refused;
}

py::list Give(std::vector<SharedContent>& contents, const Texts* texts, const py::object& given,
              bool lsbFirst)
{
    py::list equations(contents.size());
    for (size_t place = 0; place < contents.size(); ++place) {
        py::object text;
        if (texts)
            text = py::reinterpret_borrow<py::object>(texts->At(place));
        equations[place] = Wrap({std::move(contents[place]), std::move(text), given, lsbFirst});
    }
    return equations;
}

py::list Equations(const py::object& texts, const py::object& inputs, const py::object& lsbFirst)
{
    const py::object given = inputs.is_none() ? inputs : RequireInputs(inputs);
    const bool isLsbFirst = RequireFlag(lsbFirst, "lsb_first");
    const Terms terms = TermsOf(given, isLsbFirst);
    const Texts all(texts);
    std::vector<SharedContent> contents;
    const size_t refused = SetAll(all.Size(), contents, [&](size_t place, auto& equation) {
        return all.Bytes(place) && Set(equation, all.Bytes(place), terms);
    });
    if (refused == all.Size())
        return Give(contents, &all, given, isLsbFirst);
    const auto text = py::reinterpret_borrow<py::str>(all.At(refused));
    try {
        RaiseParseError(text, Encode(text), terms.reading);
    } catch (py::error_already_set& error) {
        error.value().attr("add_note")("it is texts[" + std::to_string(refused) + "]");
        throw;
    }
}

// Each element of 'words' is a function: 'numWords' words of 64 rows, row k in bit k % 64 of word
// k / 64, over the inputs.
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
    const Terms terms = TermsOf(given, false);
    const unsigned int rowsPerDigit = numInputs == 1 ? 1 : 4;
    const size_t numDigits = (size_t(1) << numInputs) / rowsPerDigit;
    std::vector<SharedContent> contents;
    const size_t refused = SetAll(size, contents, [&](size_t place, auto& equation) {
        const auto* const element = reinterpret_cast<const uint64_t*>(
            static_cast<const char*>(info.ptr) + static_cast<py::ssize_t>(place) * info.strides[0]);
        std::string text = numInputs == 1 ? "0b" : "0x";
        for (size_t digit = numDigits; digit-- > 0;) {
            const size_t row = digit * rowsPerDigit;
            const uint64_t rows = element[row / 64] >> (row % 64);
            text += "0123456789abcdef"[rows & ((1u << rowsPerDigit) - 1)];
        }
        return equation.SetEquationWithExplicitTerms(terms.names, text.c_str(), false, false);
    });
    if (refused != size)
        throw py::value_error("values[" + std::to_string(refused) + "] is not an init value");
    return Give(contents, nullptr, given, false);
}

} // namespace

void BindMany(py::module_& module)
{
    module.def("equations", &Equations);
    module.def("from_words", &FromWords);
}

} // namespace booleq_python
