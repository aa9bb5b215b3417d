// Many rows at once: arrays of assignments, truth tables and columns. NumPy is used only through
// its Python interface and the buffers of its arrays, so any version of it works.
#include <algorithm>
#include <atomic>
#include <cassert>
#include <memory>
#include <string>
#include <utility>
#include <vector>

#include "bind.h"
#include "errors.h"
#include "lock.h"
#include "packing.h"
#include "parallel.h"
#include "text.h"
#include "unicode.h"
#include "watch.h"
#include "word_program.h"

namespace booleq_python {

namespace {

constexpr size_t kPartRows = 16 * kBlockRows; // rows that a thread takes at a time
constexpr size_t kNodesLikeLookUps = 1500;    // nodes that take as long as a look-up in a column
constexpr size_t kMaxCopiedInputs = 16;       // up to here, the column is always copied
constexpr size_t kNoRow = static_cast<size_t>(-1);

// The packed column that a NumPy array shows.
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

uint8_t* DataOf(const py::object& array)
{
    return static_cast<uint8_t*>(py::buffer(array).request(true).ptr);
}

ItemKind KindOf(const py::buffer_info& info)
{
    const bool isFloat = info.format == "f" || info.format == "d";
    switch (info.itemsize) {
    case 1:
        return ItemKind::Byte;
    case 2:
        return ItemKind::Word16;
    case 4:
        return isFloat ? ItemKind::Float32 : ItemKind::Word32;
    default:
        assert(info.itemsize == 8);
        return isFloat ? ItemKind::Float64 : ItemKind::Word64;
    }
}

// The assignments to evaluate: a column for each input, or bytes row by row.
struct Assignments {
    size_t numRows = 0;
    std::vector<ValueColumn> columns;
    bool isRows = false;
    ByteRows rows = {};

    bool Pack(size_t first, size_t numRowsOfBlock, uint64_t* block) const
    {
        if (isRows)
            return PackRows(rows, first, numRowsOfBlock, block, kBlockWords);
        bool isFine = true;
        for (size_t input = 0; input < columns.size(); ++input)
            isFine =
                PackColumn(columns[input], first, numRowsOfBlock, block + kBlockWords * input) &&
                isFine;
        return isFine;
    }
};

// How a function is evaluated for blocks of assignments.
class Evaluator {
  public:
    // Cost: that of the column if one is used.
    Evaluator(const Content& content, size_t numRows) : m_num_inputs(content.NumInputs())
    {
        const bool hasColumn = m_num_inputs <= booleq::kMaxFunctionInputs;
        const size_t numTableRows = hasColumn ? size_t(1) << m_num_inputs : kNoRow;
        const bool isInit = content.IsInit();
        if (isInit && m_num_inputs <= kMaxExpandedInputs) {
            RequireRows(content);
            m_program = std::make_unique<WordProgram>(Expanded(m_rows));
            return;
        }
        // Digits are a column that only needs copying; their expression would be large.
        if (isInit && (m_num_inputs <= kMaxCopiedInputs || numTableRows / 64 <= numRows)) {
            RequireRows(content);
            return;
        }
        if (isInit) {
            m_digits = &content.equation;
            return;
        }
        const booleq::Expression expression = booleq::ToExpression(content.equation);
        if (numTableRows <= numRows && expression.nodes.size() > kNodesLikeLookUps)
            RequireRows(content);
        else
            m_program = std::make_unique<WordProgram>(expression);
    }

    // The results of the rows packed in the block, as bytes.
    void Run(std::vector<uint64_t>& block, size_t numRows, uint8_t* results) const
    {
        if (m_program) {
            UnpackBits(m_program->Run(block.data(), (numRows + 63) / 64), numRows, results);
            return;
        }
        if (m_digits)
            return RunByRow(block, numRows, results);
        std::vector<uint32_t> numbers(numRows);
        std::vector<uint8_t> values(numRows);
        for (size_t input = 0; input < m_num_inputs; ++input) {
            UnpackBits(block.data() + kBlockWords * input, numRows, values.data());
            for (size_t row = 0; row < numRows; ++row)
                numbers[row] = 2 * numbers[row] + values[row];
        }
        for (size_t row = 0; row < numRows; ++row)
            results[row] = m_rows.At(numbers[row]) ? 1 : 0;
    }

    size_t BlockSize() const
    {
        return m_program ? m_program->BlockSize() : kBlockWords * m_num_inputs;
    }

  private:
    void RequireRows(const Content& content)
    {
        const bool hasRows = booleq::RowsOf(content.equation, m_rows);
        assert(hasRows);
        static_cast<void>(hasRows);
    }

    void RunByRow(const std::vector<uint64_t>& block, size_t numRows, uint8_t* results) const
    {
        Kq_BoolEquation equation(*m_digits);
        std::vector<unsigned int> values(m_num_inputs);
        for (size_t row = 0; row < numRows; ++row) {
            for (size_t input = 0; input < m_num_inputs; ++input)
                values[input] = block[kBlockWords * input + row / 64] >> (row % 64) & 1u ? 1u : 0u;
            results[row] = static_cast<uint8_t>(ValueOf(equation, values));
        }
    }

    // One of three: a program, an init value that is evaluated row by row, or a column.
    size_t m_num_inputs;
    std::unique_ptr<WordProgram> m_program;
    const Kq_BoolEquation* m_digits = nullptr;
    booleq::Rows m_rows;
};

// Evaluates all rows. Returns the first row of the first block that has a value other than 0 and 1,
// or kNoRow.
size_t EvaluateAll(const Evaluator& evaluator, const Assignments& assignments, uint8_t* results)
{
    std::atomic<size_t> fault{kNoRow};
    booleq::RunInParts(assignments.numRows, kPartRows, booleq::LutWork(),
                       [&](size_t begin, size_t end) {
                           std::vector<uint64_t> block(evaluator.BlockSize());
                           for (size_t row = begin; row < end; row += kBlockRows) {
                               const size_t numRows = std::min(kBlockRows, end - row);
                               if (!assignments.Pack(row, numRows, block.data())) {
                                   size_t known = fault;
                                   while (row < known && !fault.compare_exchange_weak(known, row)) {
                                   }
                                   return;
                               }
                               evaluator.Run(block, numRows, results + row);
                           }
                       });
    return fault;
}

// The results as an array, or the row and the input of the first value that is neither 0 nor 1.
py::object Evaluate(const Equation& equation, const Assignments& assignments)
{
    py::object results = NewArray(py::make_tuple(assignments.numRows));
    uint8_t* const bytes = DataOf(results);
    const SharedContent content = equation.Shared();
    const size_t numRows = assignments.numRows;
    const Length length = equation.GetLength();
    const auto evaluator = Run(length, [content, numRows] {
        return std::make_shared<const Evaluator>(*content, numRows);
    });
    const bool isLong = numRows > kBlockRows || length != Length::Short;
    const size_t fault =
        FreelyIf(isLong, [&] { return EvaluateAll(*evaluator, assignments, bytes); });
    if (fault == kNoRow)
        return results;
    for (size_t row = fault; row < assignments.numRows; ++row)
        for (size_t input = 0; input < equation.NumInputs(); ++input) {
            const ValueColumn column = assignments.isRows
                                           ? ValueColumn{assignments.rows.data + input,
                                                         assignments.rows.rowStride, ItemKind::Byte}
                                           : assignments.columns[input];
            if (IsFault(column, row))
                return py::make_tuple(row, input);
        }
    assert(false && "there is a fault");
    return py::none();
}

// 'columns' are one-dimensional arrays in this machine's byte order, one for each input, each of
// length 'numRows'.
py::object EvalColumns(const py::object& self, const py::list& columns, size_t numRows)
{
    const Equation& equation = Own(self);
    std::vector<py::buffer_info> infos;
    Assignments assignments;
    assignments.numRows = numRows;
    for (const py::handle column : columns) {
        infos.push_back(py::reinterpret_borrow<py::buffer>(column).request());
        const py::buffer_info& info = infos.back();
        assert(info.ndim == 1 && static_cast<size_t>(info.shape[0]) == numRows);
        assignments.columns.push_back(
            {static_cast<const uint8_t*>(info.ptr), info.strides[0], KindOf(info)});
    }
    if (assignments.columns.size() != equation.NumInputs())
        throw py::value_error("a column for each input");
    return Evaluate(equation, assignments);
}

py::object EvalTable(const py::object& self, const py::buffer& table)
{
    const Equation& equation = Own(self);
    const py::buffer_info info = table.request();
    if (info.ndim != 2 || static_cast<size_t>(info.shape[1]) != equation.NumInputs())
        throw py::value_error("a column for each input");
    Assignments assignments;
    assignments.numRows = static_cast<size_t>(info.shape[0]);
    const auto* const data = static_cast<const uint8_t*>(info.ptr);
    const ItemKind kind = KindOf(info);
    const auto numColumns = static_cast<size_t>(info.shape[1]);
    assignments.isRows = kind == ItemKind::Byte && info.strides[1] == 1 && numColumns > 0 &&
                         info.strides[0] >= info.shape[1];
    if (assignments.isRows)
        assignments.rows = {data, assignments.numRows, numColumns, info.strides[0]};
    for (py::ssize_t column = 0; column < info.shape[1]; ++column)
        assignments.columns.push_back({data + column * info.strides[1], info.strides[0], kind});
    return Evaluate(equation, assignments);
}

py::object TruthTable(const py::object& self)
{
    const Equation& equation = Own(self);
    const size_t numInputs = equation.NumInputs();
    if (numInputs > booleq::kMaxFunctionInputs)
        throw py::value_error(booleq::NoFunctionReason(numInputs));
    const size_t numRows = size_t(1) << numInputs;
    py::object table = NewArray(py::make_tuple(numRows, numInputs + 1));
    uint8_t* const bytes = DataOf(table);
    const booleq::Rows column = RowsOf(equation);
    FreelyIf(numRows > 1024, [&] {
        booleq::RunInParts(numRows, 8192, booleq::LutWork(), [&](size_t begin, size_t end) {
            uint8_t* byte = bytes + begin * (numInputs + 1);
            for (size_t row = begin; row < end; ++row) {
                // The first input is the highest bit of the row number.
                for (size_t input = 0; input < numInputs; ++input)
                    *byte++ = static_cast<uint8_t>(row >> (numInputs - 1 - input) & 1u);
                *byte++ = column.At(row) ? 1 : 0;
            }
        });
    });
    return table;
}

py::object Column(const py::object& self)
{
    const Equation& equation = Own(self);
    const booleq::Rows rows = RowsOf(equation);
    const size_t numRows = rows.NumRows();
    py::object column = NewArray(py::make_tuple(numRows));
    uint8_t* const bytes = DataOf(column);
    FreelyIf(numRows > 65536, [&] {
        booleq::RunInParts(numRows, size_t(1) << 20, booleq::LutWork(),
                           [&](size_t begin, size_t end) {
                               UnpackBits(rows.Words() + begin / 64, end - begin, bytes + begin);
                           });
    });
    return column;
}

py::object PackedColumn(const py::object& self)
{
    auto owner = std::make_unique<Words>(Words{RowsOf(Own(self))});
    return NumPy().attr("frombuffer")(py::cast(std::move(owner)), "uint64");
}

// An array of objects as bytes: 0 and 1 as they are, 3 for None and 'missing' (pandas' NA), and 2
// for anything else, not-a-number included.
py::object NarrowObjects(const py::object& array, const py::object& missing)
{
    const py::tuple values(array.attr("tolist")());
    py::object narrowed = NewArray(py::make_tuple(values.size()));
    uint8_t* byte = DataOf(narrowed);
    const uint8_t* const first = byte;
    for (const py::handle value : values) {
        if ((byte - first) % 4096 == 0)
            CheckSignals();
        unsigned int bit = 2;
        if (value.is_none() || value.is(missing))
            bit = 3;
        else if (PyFloat_Check(value.ptr()))
            bit = PyFloat_AS_DOUBLE(value.ptr()) == 0.0   ? 0
                  : PyFloat_AS_DOUBLE(value.ptr()) == 1.0 ? 1
                                                          : 2;
        else if (!IsBit(value, bit))
            bit = 2;
        *byte++ = static_cast<uint8_t>(bit);
    }
    return narrowed;
}

} // namespace

void BindArrays(py::module_& module)
{
    // Owns a packed column while an array shows it; Python code never makes one.
    py::class_<Words>(module, "_Words", py::buffer_protocol(), py::module_local())
        .def_buffer([](Words& self) {
            return py::buffer_info(self.rows.Words(), static_cast<py::ssize_t>(self.rows.Size()));
        });
    module.def("eval_columns", &EvalColumns);
    module.def("eval_table", &EvalTable);
    module.def("truth_table", &TruthTable);
    module.def("column", &Column);
    module.def("packed_column", &PackedColumn);
    module.def("narrow_objects", &NarrowObjects);
}

} // namespace booleq_python
