// Tables of functions, completed row by row as by the tool's command 'batch'.
#include "batch.h"

#include <cassert>
#include <string>
#include <utility>
#include <vector>

#include "bind.h"
#include "lock.h"
#include "messages.h"
#include "parallel.h"
#include "text.h"
#include "unicode.h"

namespace booleq_python {

namespace {

constexpr size_t kPart = 512; // rows that a thread takes at a time

typedef std::vector<booleq::BatchRow> BatchRows;
typedef std::vector<booleq::BatchResult> BatchResults;

// Whether a cell is None, not-a-number, pandas' NA, or a text of only blanks.
bool IsMissing(const py::handle& cell, const py::object& missing)
{
    if (cell.is_none() || cell.is(missing))
        return true;
    if (PyFloat_Check(cell.ptr()))
        return PyFloat_AS_DOUBLE(cell.ptr()) != PyFloat_AS_DOUBLE(cell.ptr());
    if (!PyUnicode_Check(cell.ptr()))
        return false;
    const std::string text = Encode(py::reinterpret_borrow<py::str>(cell));
    return text.find_first_not_of(" \t") == std::string::npos;
}

std::string Where(const char* column, size_t row)
{
    return std::string(column) + "[" + std::to_string(row) + "]";
}

// The text of a cell.  Requires: the cell is not missing.
std::string TextOf(const py::handle& cell, const char* column, size_t row)
{
    std::string text =
        Encode(RequireStr(py::reinterpret_borrow<py::object>(cell), Where(column, row).c_str()));
    if (text.find('\0') != std::string::npos)
        throw py::value_error(Where(column, row) + " has a NUL character");
    return text;
}

// Takes a list of names, or a text with commas.  Fails: false for a quote that is not closed.
bool TakeInputs(const py::handle& cell, size_t row, std::vector<std::string>& inputs)
{
    if (PyUnicode_Check(cell.ptr()))
        return booleq::SplitInputs(TextOf(cell, "inputs", row), inputs);
    if (PyList_Check(cell.ptr()) || PyTuple_Check(cell.ptr())) {
        for (const py::handle name : cell)
            inputs.push_back(TextOf(name, "inputs", row));
        return true;
    }
    throw py::type_error(Where("inputs", row) + " must be a text or a list of names, not " +
                         TypeName(cell));
}

// An int as the digits of all rows of so many inputs; a text as it is.
std::string InitOf(const py::handle& cell, size_t numInputs, size_t row)
{
    if (!PyIndex_Check(cell.ptr()))
        return TextOf(cell, "init", row);
    if (numInputs == 0 || numInputs > booleq::kMaxFunctionInputs)
        throw py::value_error(Where("init", row) + " is an int, which takes 1 to " +
                              std::to_string(booleq::kMaxFunctionInputs) + " listed inputs");
    const auto number = py::reinterpret_steal<py::object>(PyNumber_Index(cell.ptr()));
    if (!number)
        throw py::error_already_set();
    const size_t numRows = size_t(1) << numInputs;
    if (number < py::int_(0) || number.attr("bit_length")().cast<size_t>() > numRows)
        throw py::value_error(Where("init", row) + ": 0 <= value < 2**" + std::to_string(numRows));
    const bool isBinary = numInputs == 1;
    const std::string format =
        "0" + std::to_string(isBinary ? 2 : numRows / 4) + (isBinary ? "b" : "x");
    return (isBinary ? "0b" : "0x") + number.attr("__format__")(format).cast<std::string>();
}

struct Columns {
    py::list inputs;
    py::list equations;
    py::list inits;
};

// Fills the rows with the given cells, and sets the outcome of rows that cannot be read.
void ReadRows(const Columns& columns, const py::object& missing, BatchRows& rows,
              BatchResults& results)
{
    for (size_t row = 0; row < rows.size(); ++row) {
        if (row % kPart == 0)
            CheckSignals();
        const py::handle inputs = columns.inputs[row];
        if (!IsMissing(inputs, missing) && !TakeInputs(inputs, row, rows[row].inputs))
            results[row] = {booleq::BatchOutcome::kTextRefused,
                            "a single quote is not closed among the inputs"};
        if (!IsMissing(columns.equations[row], missing))
            rows[row].equation = TextOf(columns.equations[row], "equation", row);
        if (!IsMissing(columns.inits[row], missing))
            rows[row].init = InitOf(columns.inits[row], rows[row].inputs.size(), row);
    }
}

void CompleteRows(BatchRows& rows, BatchResults& results)
{
    booleq::RunInParts(rows.size(), kPart, booleq::LutWork(), [&](size_t begin, size_t end) {
        const booleq::NoMessages silence;
        booleq::RowCompleter completer;
        for (size_t row = begin; row < end; ++row)
            if (results[row].outcome == booleq::BatchOutcome::kOk)
                results[row] = completer.Complete(rows[row]);
    });
}

// Fills the missing cells, and returns the outcomes and the messages.
py::tuple Batch(const py::list& inputs, const py::list& equations, const py::list& inits,
                const py::object& missing)
{
    const Columns columns = {inputs, equations, inits};
    assert(inputs.size() == equations.size() && inputs.size() == inits.size());
    BatchRows rows(inputs.size());
    BatchResults results(rows.size());
    ReadRows(columns, missing, rows, results);
    FreelyIf(rows.size() > 8, [&] { CompleteRows(rows, results); });

    py::list outcomes(rows.size());
    py::list messages(rows.size());
    for (size_t row = 0; row < rows.size(); ++row) {
        if (row % kPart == 0)
            CheckSignals();
        const booleq::BatchResult& result = results[row];
        outcomes[row] = py::str(booleq::OutcomeName(result.outcome));
        messages[row] = result.message.empty() ? py::none() : py::object(Decode(result.message));
        if (result.outcome != booleq::BatchOutcome::kFilled)
            continue;
        if (IsMissing(inputs[row], missing) && !rows[row].inputs.empty())
            columns.inputs[row] = Decode(booleq::Join(rows[row].inputs, ","));
        if (IsMissing(equations[row], missing))
            columns.equations[row] = Decode(rows[row].equation);
        if (IsMissing(inits[row], missing))
            columns.inits[row] = Decode(rows[row].init);
    }
    return py::make_tuple(outcomes, messages);
}

} // namespace

void BindBatch(py::module_& module)
{
    module.def("batch", &Batch);
}

} // namespace booleq_python
