// Arrays of look-up tables: passes what booleq/_luts.py gives to the kernels of logic/luts. Tables
// and results are NumPy buffers, made and checked there; they are dense and aligned.
#include <algorithm>
#include <cassert>
#include <cstring>
#include <string>
#include <vector>

#include "bind.h"
#include "canonical.h"
#include "distinct_luts.h"
#include "errors.h"
#include "init_literal.h"
#include "listed_inputs.h"
#include "lock.h"
#include "lut_kernels.h"
#include "lut_texts.h"
#include "number_array.h"
#include "parallel.h"
#include "text.h"
#include "unicode.h"

namespace booleq_python {

namespace {

// A dense buffer; one of two dimensions has a table or an order in each row.
struct Dense {
    explicit Dense(const py::buffer& buffer, bool isWritten = false)
        : info(buffer.request(isWritten))
    {
        py::ssize_t stride = info.itemsize;
        for (py::ssize_t dimension = info.ndim; dimension-- > 0;) {
            if (info.shape[static_cast<size_t>(dimension)] > 1 &&
                info.strides[static_cast<size_t>(dimension)] != stride)
                throw py::value_error("an array that is not dense");
            stride *= info.shape[static_cast<size_t>(dimension)];
        }
    }
    size_t Count() const { return info.ndim == 0 ? 1 : static_cast<size_t>(info.shape[0]); }
    size_t RowBytes() const
    {
        return static_cast<size_t>(info.itemsize * (info.ndim > 1 ? info.shape[1] : 1));
    }
    uint8_t* Bytes() const { return static_cast<uint8_t*>(info.ptr); }

    py::buffer_info info;
};

booleq::LutArray LutsOf(const Dense& tables, unsigned int numInputs)
{
    const auto tableBytes = static_cast<unsigned int>(tables.RowBytes());
    if (numInputs > booleq::kMaxLutInputs || !booleq::HasLutShape(numInputs, tableBytes))
        throw py::value_error("tables of another width");
    return {tables.Bytes(), tables.Count(), numInputs, tableBytes};
}

// Results and arguments must have an element for each table.
void RequireCount(const Dense& dense, size_t count, size_t rowBytes)
{
    if (dense.Count() != count || dense.RowBytes() != rowBytes)
        throw py::value_error("an array of another shape");
}

// Calls work(luts) with the lock released. 'results' has an element of 'rowBytes' bytes for each
// table; 0: as many as a table has.
template <class Work>
void WithLuts(const py::buffer& tables, unsigned int numInputs, const Dense& results,
              size_t rowBytes, const Work& work)
{
    const Dense dense(tables);
    const booleq::LutArray luts = LutsOf(dense, numInputs);
    RequireCount(results, luts.count, rowBytes == 0 ? dense.RowBytes() : rowBytes);
    FreelyIf(luts.count > 1000, [&] { work(luts); });
}

void Evaluate(const py::buffer& tables, unsigned int numInputs, const py::buffer& rows,
              const py::buffer& results)
{
    const Dense all(rows);
    const Dense out(results, true);
    WithLuts(tables, numInputs, out, 1, [&](const booleq::LutArray& luts) {
        if (all.info.ndim == 0) {
            booleq::EvaluateLuts(luts, *all.Bytes(), out.Bytes());
        } else {
            RequireCount(all, luts.count, 1);
            booleq::EvaluateLutsEach(luts, all.Bytes(), out.Bytes());
        }
    });
}

// Returns the place of the first order that is not a permutation, or None.
py::object Permute(const py::buffer& tables, unsigned int numInputs, const py::buffer& orders,
                   const py::buffer& results)
{
    const Dense all(orders);
    const Dense out(results, true);
    size_t place = booleq::kNoLut;
    WithLuts(tables, numInputs, out, 0, [&](const booleq::LutArray& luts) {
        const bool isOne = all.info.ndim == 1;
        if (isOne ? all.Count() != numInputs
                  : all.Count() != luts.count || all.RowBytes() != numInputs)
            throw py::value_error("orders of another shape");
        place = booleq::FirstBadOrder(all.Bytes(), isOne ? 1 : luts.count, numInputs);
        if (place != booleq::kNoLut)
            return;
        if (isOne)
            booleq::PermuteLuts(luts, all.Bytes(), out.Bytes());
        else
            booleq::PermuteLutsEach(luts, all.Bytes(), out.Bytes());
    });
    if (place == booleq::kNoLut)
        return py::none();
    return py::int_(place);
}

void Invert(const py::buffer& tables, unsigned int numInputs, const py::buffer& results)
{
    const Dense out(results, true);
    WithLuts(tables, numInputs, out, 0,
             [&](const booleq::LutArray& luts) { booleq::InvertLuts(luts, out.Bytes()); });
}

void Fix(const py::buffer& tables, unsigned int numInputs, unsigned int input, bool value,
         const py::buffer& results)
{
    const Dense out(results, true);
    WithLuts(tables, numInputs, out, out.RowBytes(), [&](const booleq::LutArray& luts) {
        if (input >= numInputs ||
            !booleq::HasLutShape(numInputs - 1, static_cast<unsigned int>(out.RowBytes())))
            throw py::value_error("no such input, or tables of a different width");
        booleq::FixLutInput(luts, input, value, out.Bytes(),
                            static_cast<unsigned int>(out.RowBytes()));
    });
}

// Writes a byte for each input: 1 if it is in the set.
void SpreadSet(unsigned int set, unsigned int numInputs, uint8_t* bytes)
{
    for (unsigned int input = 0; input < numInputs; ++input)
        bytes[input] = static_cast<uint8_t>(set >> input & 1u);
}

// Runs work that is quick for each table.
void InParts(size_t count, const booleq::PartRunner& run)
{
    booleq::RunInParts(count, 65536, booleq::LutWork(), run);
}

void Supports(const py::buffer& tables, unsigned int numInputs, const py::buffer& results)
{
    const Dense out(results, true);
    WithLuts(tables, numInputs, out, numInputs, [&](const booleq::LutArray& luts) {
        std::vector<uint8_t> sets(luts.count);
        booleq::FindLutSupports(luts, sets.data());
        InParts(luts.count, [&](size_t begin, size_t end) {
            for (size_t place = begin; place < end; ++place)
                SpreadSet(sets[place], numInputs, out.Bytes() + place * numInputs);
        });
    });
}

void CountOnes(const py::buffer& tables, unsigned int numInputs, const py::buffer& results)
{
    const Dense out(results, true);
    WithLuts(tables, numInputs, out, 1,
             [&](const booleq::LutArray& luts) { booleq::CountLutOnes(luts, out.Bytes()); });
}

// The words of the distinct tables, their first places, their counts, and which one each table is.
py::tuple Distinct(const py::buffer& tables, unsigned int numInputs)
{
    booleq::DistinctLuts distinct;
    std::vector<uint64_t> places;
    const Dense all(tables);
    WithLuts(tables, numInputs, all, 0, [&](const booleq::LutArray& luts) {
        places.resize(luts.count);
        distinct = booleq::FindDistinctLuts(luts, places.data());
    });
    return py::make_tuple(ArrayOf(distinct.words), ArrayOf(distinct.firstPlaces),
                          ArrayOf(distinct.counts), ArrayOf(places));
}

// Writes forms, orders (a row for each table), inversions of inputs (likewise) and of outputs.
void Canonical(const py::buffer& tables, unsigned int numInputs, bool hasInversions,
               const py::buffer& forms, const py::buffer& orders, const py::buffer& inverted,
               const py::buffer& outputs)
{
    const Dense outForms(forms, true);
    const Dense outOrders(orders, true);
    const Dense outInverted(inverted, true);
    const Dense outOutputs(outputs, true);
    WithLuts(tables, numInputs, outForms, 0, [&](const booleq::LutArray& luts) {
        if (numInputs > booleq::kMaxCanonicalInputs)
            throw py::value_error("canonical forms are for up to six inputs");
        RequireCount(outOrders, luts.count, numInputs);
        RequireCount(outInverted, luts.count, numInputs);
        RequireCount(outOutputs, luts.count, 1);
        const auto scope = hasInversions ? booleq::CanonicalScope::OrderAndInversions
                                         : booleq::CanonicalScope::Order;
        std::vector<booleq::LutTransformation> transformations(luts.count);
        booleq::FindCanonicals(luts, scope, outForms.Bytes(), transformations.data());
        InParts(luts.count, [&](size_t begin, size_t end) {
            for (size_t place = begin; place < end; ++place) {
                const booleq::LutTransformation& found = transformations[place];
                std::copy_n(found.order, numInputs, outOrders.Bytes() + place * numInputs);
                SpreadSet(found.invertedInputs, numInputs, outInverted.Bytes() + place * numInputs);
                outOutputs.Bytes()[place] = found.invertsOutput;
            }
        });
    });
}

py::tuple Describe(const py::buffer& tables, unsigned int numInputs, const py::object& inputs)
{
    const std::vector<std::string> names = EncodeAll(RequireInputs(inputs));
    if (names.size() != numInputs)
        throw py::value_error("inputs must be " + booleq::Count(numInputs, "name"));
    booleq::LutTexts described;
    std::vector<uint64_t> places;
    const Dense all(tables);
    WithLuts(tables, numInputs, all, 0, [&](const booleq::LutArray& luts) {
        places.resize(luts.count);
        described = booleq::DescribeLuts(luts, names, places.data());
    });
    py::list texts;
    for (const booleq::LutText& text : described.texts)
        texts.append(
            py::make_tuple(text.kind.empty() ? py::none() : py::object(Decode(text.kind)),
                           text.kind.empty() ? py::none() : py::object(Decode(text.name)),
                           text.shortForm.empty() ? py::none() : py::object(Decode(text.shortForm)),
                           text.numLiterals, text.isMinimal));
    return py::make_tuple(ArrayOf(described.distinct.words),
                          ArrayOf(described.distinct.firstPlaces),
                          ArrayOf(described.distinct.counts), ArrayOf(places), texts);
}

[[noreturn]] void RaiseValue(size_t place, const std::string& fault)
{
    throw py::value_error("values[" + std::to_string(place) + "]: " + fault);
}

unsigned int DigitValue(char digit)
{
    const char lower = static_cast<char>(digit | 0x20);
    if (digit >= '0' && digit <= '9')
        return static_cast<unsigned int>(digit - '0');
    return lower >= 'a' && lower <= 'f' ? static_cast<unsigned int>(lower - 'a') + 10 : 16;
}

// Reads the rows of "0x..." and "0b..." with all their digits, and of sized literals.
void ReadText(const std::string& text, unsigned int numInputs, size_t place, uint64_t* words)
{
    const booleq::InitLiteral literal = booleq::ReadInitLiteral(text, numInputs);
    if (literal.code)
        RaiseValue(place, literal.reason + (literal.hint.empty() ? "" : "; " + literal.hint));
    const std::string& digits = literal.text;
    const booleq::InitWidth width = booleq::WidthOfInit(digits);
    if (width.numRows == 0)
        RaiseValue(place, "an init value begins with 0x or 0b, or is a sized literal such as "
                          "8'hca, not '" +
                              booleq::Excerpt(text) + "'");
    if (width.numRows != uint64_t(1) << numInputs)
        RaiseValue(place, "the digits of " + booleq::Excerpt(text) + " are " +
                              std::to_string(width.numRows) + " rows, and " +
                              booleq::Count(numInputs, "input") + " have " +
                              std::to_string(uint64_t(1) << numInputs));
    const unsigned int rowsPerDigit = width.isHex ? 4 : 1;
    size_t row = 0;
    for (size_t index = digits.size(); index-- > 2; row += rowsPerDigit) {
        const unsigned int value = DigitValue(digits[index]);
        if (value >= 1u << rowsPerDigit)
            RaiseValue(place, "'" + booleq::Excerpt(digits.substr(index, 1)) + "' is not a digit");
        words[row / 64] |= static_cast<uint64_t>(value) << (row % 64);
    }
}

void ReadNumber(const py::handle& value, unsigned int numInputs, size_t place, uint64_t* words)
{
    if (!PyIndex_Check(value.ptr()))
        throw py::type_error("values[" + std::to_string(place) +
                             "] must be an int or a text, not " + TypeName(value));
    const auto number = py::reinterpret_steal<py::object>(PyNumber_Index(value.ptr()));
    if (!number)
        throw py::error_already_set();
    uint8_t bytes[16];
    if (_PyLong_AsByteArray(reinterpret_cast<PyLongObject*>(number.ptr()), bytes, sizeof bytes, 1,
                            0) != 0) {
        PyErr_Clear();
        RaiseValue(place, "0 <= value < 2**" + std::to_string(1u << numInputs));
    }
    for (unsigned int index = 0; index < 16; ++index)
        words[index / 8] |= static_cast<uint64_t>(bytes[index]) << (8 * (index % 8));
}

// Reads ints and texts as tables of two words each.
void ReadValues(const py::sequence& values, unsigned int numInputs, const py::buffer& results)
{
    const Dense out(results, true);
    const auto fast = py::reinterpret_steal<py::object>(
        PySequence_Fast(values.ptr(), "values must be a sequence"));
    if (!fast)
        throw py::error_already_set();
    const auto size = static_cast<size_t>(PySequence_Fast_GET_SIZE(fast.ptr()));
    assert(size == out.Count() && out.RowBytes() == 16);
    for (size_t place = 0; place < size; ++place) {
        const py::handle value =
            PySequence_Fast_GET_ITEM(fast.ptr(), static_cast<Py_ssize_t>(place));
        uint64_t words[2] = {0, 0};
        if (PyUnicode_Check(value.ptr()))
            ReadText(Encode(RequireStr(value, "a value")), numInputs, place, words);
        else
            ReadNumber(value, numInputs, place, words);
        std::memcpy(out.Bytes() + 16 * place, words, sizeof words);
        if (place % 4096 == 0)
            CheckSignals();
    }
}

} // namespace

void BindLuts(py::module_& module)
{
    module.def("lut_evaluate", &Evaluate);
    module.def("lut_permute", &Permute);
    module.def("lut_invert", &Invert);
    module.def("lut_fix", &Fix);
    module.def("lut_supports", &Supports);
    module.def("lut_count_ones", &CountOnes);
    module.def("lut_distinct", &Distinct);
    module.def("lut_canonical", &Canonical);
    module.def("lut_describe", &Describe);
    module.def("lut_read", &ReadValues);
}

} // namespace booleq_python
