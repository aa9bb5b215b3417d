// Many rows at once: arrays of assignments, truth tables and columns. NumPy is used through its
// Python interface and the buffers of its arrays, so any version of it does.
#include <memory>
#include <string>
#include <utility>
#include <vector>

#include "bind.h"
#include "errors.h"
#include "expression.h"
#include "packing.h"
#include "text.h"

namespace booleq_python {

namespace {

constexpr size_t kNodesLikeLookUps = 40;

// A packed column that an array shows.
struct Words {
    booleq::Rows rows;
};

py::module_ NumPy()
{
    return py::module_::import("numpy");
}

py::object NewArray(const py::tuple& shape)
{
    return NumPy().attr("empty")(shape, "uint8");
}

uint8_t* DataOf(const py::buffer_info& info)
{
    return static_cast<uint8_t*>(info.ptr);
}

// The argument of eval_many as an array of integers of this machine's byte order.
py::buffer RequireAssignments(const Equation& equation, const py::object& assignments)
{
    py::object array = NumPy().attr("asarray")(assignments);
    const py::object type = array.attr("dtype");
    const std::string kind = py::str(type.attr("kind"));
    if (kind != "b" && kind != "i" && kind != "u")
        throw py::type_error("assignments must be bool or integers, not " +
                             std::string(py::str(type)));
    const py::object shape = array.attr("shape");
    if (py::len(shape) != 2 || shape[py::int_(1)].cast<size_t>() != equation.NumInputs())
        throw py::value_error("assignments must have the shape (rows, " +
                              std::to_string(equation.NumInputs()) +
                              "), a column for each input, "
                              "not " +
                              std::string(py::str(shape)));
    if (!type.attr("isnative").cast<bool>())
        array = array.attr("astype")(type.attr("newbyteorder")("="));
    return py::buffer(array);
}

// Packs all rows and hands each block to 'answer', which gives back the block's results as a word.
template <class Answer>
void ForEachBlock(const Table& table, const py::object& array, uint8_t* results,
                  const Answer& answer)
{
    RowPacker packer(table);
    for (size_t row = 0; row < table.numRows; row += RowPacker::kBlockRows) {
        if (!packer.Pack(row)) {
            const TableFault& fault = packer.Fault();
            const std::string place =
                std::to_string(fault.row) + ", " + std::to_string(fault.column);
            const py::object value = array[py::make_tuple(fault.row, fault.column)];
            throw py::value_error("assignments[" + place + "] must be 0 or 1, not " +
                                  std::string(py::str(value)));
        }
        UnpackBits(answer(packer), packer.NumRows(), results + row);
        CheckSignals();
    }
}

// 64 rows a word, through the expression.
void EvalByWords(const booleq::Expression& expression, const Table& table, const py::object& array,
                 uint8_t* results)
{
    std::vector<uint64_t> inputs;
    std::vector<uint64_t> stack;
    ForEachBlock(table, array, results, [&](const RowPacker& packer) {
        packer.ToWords(inputs);
        return EvaluateWord(expression, inputs, stack);
    });
}

// Row by row, from the column.
void EvalByColumn(const Equation& equation, const Table& table, const py::object& array,
                  uint8_t* results)
{
    const booleq::Rows column = RowsOf(equation);
    ForEachBlock(table, array, results, [&](const RowPacker& packer) {
        uint64_t word = 0;
        for (size_t row = 0; row < packer.NumRows(); ++row) {
            const uint64_t number = packer.RowNumber(row);
            word |= static_cast<uint64_t>(column.At(number) ? 1 : 0) << row;
        }
        return word;
    });
}

// Row by row, as somebody would who sets each input.
void EvalByRows(const Equation& equation, const Table& table, const py::object& array,
                uint8_t* results)
{
    Equation copy(equation);
    ForEachBlock(table, array, results, [&](const RowPacker& packer) {
        uint64_t word = 0;
        for (size_t row = 0; row < packer.NumRows(); ++row) {
            for (size_t column = 0; column < table.numColumns; ++column)
                copy.SetValue(column, packer.At(row, column) ? 1 : 0);
            word |= static_cast<uint64_t>(copy.Get().Eval()) << row;
        }
        return word;
    });
}

py::object EvalMany(const Equation& equation, const py::object& assignments)
{
    const py::buffer array = RequireAssignments(equation, assignments);
    const py::buffer_info info = array.request();
    Table table;
    table.data = static_cast<const uint8_t*>(info.ptr);
    table.numRows = static_cast<size_t>(info.shape[0]);
    table.numColumns = static_cast<size_t>(info.shape[1]);
    table.rowStride = info.strides[0];
    table.columnStride = info.strides[1];
    table.itemSize = static_cast<size_t>(info.itemsize);

    py::object results = NewArray(py::make_tuple(table.numRows));
    const py::buffer_info resultsInfo = py::buffer(results).request(true);
    uint8_t* const bytes = DataOf(resultsInfo);
    const bool hasColumn = table.numColumns <= booleq::kMaxFunctionInputs;
    const uint64_t numTableRows = hasColumn ? uint64_t(1) << table.numColumns : UINT64_MAX;
    if (!equation.Get().IsExpression()) {
        // The digits are a column that only needs copying; the expression would be large.
        if (numTableRows <= 64 * static_cast<uint64_t>(table.numRows))
            EvalByColumn(equation, table, array, bytes);
        else
            EvalByRows(equation, table, array, bytes);
        return results;
    }
    // A column takes as much work as that many rows through the expression, and then a look-up for
    // each row, as much as some forty nodes for 64 rows.
    const booleq::Expression expression = booleq::ToExpression(equation.Get());
    if (numTableRows <= table.numRows && expression.nodes.size() > kNodesLikeLookUps)
        EvalByColumn(equation, table, array, bytes);
    else
        EvalByWords(expression, table, array, bytes);
    return results;
}

py::object TruthTable(const Equation& equation)
{
    const size_t numInputs = equation.NumInputs();
    if (numInputs > booleq::kMaxFunctionInputs)
        throw py::value_error(booleq::NoFunctionReason(numInputs));
    const uint64_t numRows = uint64_t(1) << numInputs;
    py::object table = NewArray(py::make_tuple(numRows, numInputs + 1));
    const py::buffer_info info = py::buffer(table).request(true);
    const booleq::Rows column = RowsOf(equation);
    uint8_t* byte = DataOf(info);
    for (uint64_t row = 0; row < numRows; ++row) {
        // The first input is the highest bit of the row number.
        for (size_t input = 0; input < numInputs; ++input)
            *byte++ = static_cast<uint8_t>(row >> (numInputs - 1 - input) & 1u);
        *byte++ = column.At(row) ? 1 : 0;
        if (row % 4096 == 0)
            CheckSignals();
    }
    return table;
}

py::object Column(const Equation& equation)
{
    const booleq::Rows rows = RowsOf(equation);
    const uint64_t numRows = uint64_t(1) << equation.NumInputs();
    py::object column = NewArray(py::make_tuple(numRows));
    const py::buffer_info info = py::buffer(column).request(true);
    for (uint64_t row = 0; row < numRows; row += 64) {
        UnpackBits(rows.Words()[row / 64], std::min<uint64_t>(64, numRows - row),
                   DataOf(info) + row);
        CheckSignals();
    }
    return column;
}

py::object PackedColumn(const Equation& equation)
{
    auto owner = std::make_unique<Words>(Words{RowsOf(equation)});
    return NumPy().attr("frombuffer")(py::cast(std::move(owner)), "uint64");
}

} // namespace

void BindArrays(py::module_& module, EquationClass& type)
{
    // What owns a packed column while an array shows it; nobody makes one by hand.
    py::class_<Words>(module, "_Words", py::buffer_protocol(), py::module_local())
        .def_buffer([](Words& self) {
            return py::buffer_info(self.rows.Words(), static_cast<py::ssize_t>(self.rows.Size()));
        });
    type.def("eval_many", &EvalMany, py::arg("assignments"),
             R"doc(eval_many($record, self, assignments)
--

The results for many assignments at once, as a uint8 array.

assignments has a row for each assignment and a column for each input: bool or integers, 0 and 1.
Any number of inputs will do. ValueError for another shape or value, TypeError for another kind.

>>> from booleq import Equation
>>> Equation("A & ~B").eval_many([[1, 0], [1, 1]])
array([1, 0], dtype=uint8)
)doc");
    type.def("truth_table", &TruthTable,
             R"doc(truth_table($record, self)
--

All rows as a uint8 array: the inputs' values and, last, the result.

ValueError with more than 30 inputs, MemoryError for a table that does not fit.

>>> from booleq import Equation
>>> Equation("A & ~B").truth_table()
array([[0, 0, 0],
       [0, 1, 0],
       [1, 0, 1],
       [1, 1, 0]], dtype=uint8)
)doc");
    type.def("column", &Column,
             R"doc(column($record, self)
--

The results of all rows as a uint8 array. ValueError with more than 30 inputs.

>>> from booleq import Equation
>>> Equation("A & ~B").column()
array([0, 0, 1, 0], dtype=uint8)
)doc");
    type.def("packed_column", &PackedColumn,
             R"doc(packed_column($record, self)
--

The results of all rows, packed: row k is bit k % 64 of word k // 64 of a uint64 array.

ValueError with more than 30 inputs. The library's own memory is handed out, without a copy.

>>> from booleq import Equation
>>> Equation("A & ~B").packed_column()
array([4], dtype=uint64)
)doc");
}

} // namespace booleq_python
