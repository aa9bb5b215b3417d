// Trees, maps, explanations and lint findings, as the plain values of _results.py.
#include <string>
#include <vector>

#include <kq_logic/explain.h>
#include <kq_logic/short_form.h>

#include "bind.h"
#include "errors.h"
#include "karnaugh_map.h"
#include "lint.h"
#include "lock.h"
#include "text.h"
#include "tree.h"
#include "unicode.h"
#include "watch.h"

namespace booleq_python {

namespace {

using namespace pybind11::literals; // "name"_a

constexpr size_t kMaxMapInputs = 6; // more are too many to read

py::object Link(size_t index)
{
    if (index == booleq::TreeList::kNoNode)
        return py::none();
    return py::int_(index);
}

py::list Tree(const py::object& self)
{
    const py::object node = ResultClass("Node");
    const SharedContent content = Own(self).Shared();
    const booleq::TreeList list =
        Run(Own(self).GetLength(), [content] { return booleq::TreeList(content->equation); });
    py::list nodes;
    for (size_t index = 0; index < list.Entries().size(); ++index) {
        const booleq::TreeList::Entry& entry = list.Entries()[index];
        nodes.append(node(index, Decode(list.TypeName(index)), Decode(list.Token(index)),
                          Link(entry.parent), Link(entry.left), Link(entry.right)));
        CheckSignals();
    }
    return nodes;
}

py::str TreeDot(const py::object& self)
{
    const SharedContent content = Own(self).Shared();
    return Decode(Run(Own(self).GetLength(), [content] {
        std::string dot;
        PutDot(booleq::TreeList(content->equation), [&dot](const std::string& piece) {
            dot += piece;
            booleq::Watch();
        });
        return dot;
    }));
}

// The text, or None if it is empty.
py::object OrNone(const std::string& text)
{
    if (text.empty())
        return py::none();
    return Decode(text);
}

py::object Explain(const py::object& self)
{
    const Equation& equation = Own(self);
    const kq_logic::Function asked = FunctionOf(equation);
    kq_logic::Explanation explanation;
    kq_logic::ShortForm shortForm;
    FreelyIf(equation.NumInputs() > 3, [&] {
        explanation = kq_logic::Explain(asked);
        if (explanation.fault.empty())
            shortForm = kq_logic::FindShortForm(asked);
    });
    if (!explanation.fault.empty())
        throw py::value_error(explanation.fault);
    const py::object operands =
        shortForm.fault.empty() ? py::object(py::int_(shortForm.numOperands)) : py::none();
    return ResultClass("Explanation")(
        "inputs"_a = equation.Inputs(), "hex"_a = asked.Hex(), "binary"_a = asked.Binary(),
        "without_effect"_a = DecodeAll(explanation.idle), "kind"_a = OrNone(explanation.kind),
        "function"_a = explanation.kind.empty() ? py::none() : py::object(Decode(explanation.text)),
        "expression"_a = OrNone(shortForm.text), "operands"_a = operands,
        "minimal"_a = shortForm.isMinimal);
}

py::object KarnaughMap(const py::object& self)
{
    const Equation& equation = Own(self);
    const size_t numInputs = equation.NumInputs();
    if (numInputs == 0 || numInputs > kMaxMapInputs)
        throw py::value_error(booleq::Count(numInputs, "input") + ": a map has 1 to " +
                              std::to_string(kMaxMapInputs));
    const kq_logic::Function function = FunctionOf(equation);
    const booleq::Map map(function.Inputs());
    py::list rowLabels;
    py::list columnLabels;
    py::list cells;
    for (size_t column = 0; column < map.NumColumns(); ++column)
        columnLabels.append(Decode(map.ColumnLabel(column)));
    for (size_t row = 0; row < map.NumRows(); ++row) {
        rowLabels.append(Decode(map.RowLabel(row)));
        py::list values;
        for (size_t column = 0; column < map.NumColumns(); ++column)
            values.append(function.At(map.RowAt(row, column)) ? 1 : 0);
        cells.append(py::tuple(values));
    }
    const py::object inputs = equation.Inputs();
    const py::int_ middle(map.numRowInputs);
    return ResultClass("KarnaughMap")(
        "row_inputs"_a = inputs[py::slice(py::int_(0), middle, py::none())],
        "column_inputs"_a = inputs[py::slice(middle, py::none(), py::none())],
        "row_labels"_a = py::tuple(rowLabels), "column_labels"_a = py::tuple(columnLabels),
        "cells"_a = py::tuple(cells));
}

py::object DifferenceOf(const booleq::LintReport& report, const booleq::ForeignReading& reading)
{
    if (!reading.decision.IsDifferent())
        return py::none();
    py::dict assignment;
    for (size_t input = 0; input < report.inputs.size(); ++input)
        assignment[Decode(report.inputs[input])] = reading.decision.assignment[input] ? 1 : 0;
    return ResultClass("Difference")(
        "assignment"_a = ResultClass("Assignment")(assignment),
        "here"_a = reading.decision.left ? 1 : 0, "grouping"_a = Decode(reading.grouping),
        "reason"_a = Decode(reading.reason), "write_there"_a = Decode(reading.textThere),
        "write_here"_a = OrNone(reading.textHere));
}

py::object ReadingOf(const booleq::LintReport& report, const booleq::ForeignReading& reading)
{
    py::object refusal = py::none();
    py::object same = py::none();
    py::object comparedAll = py::none();
    if (reading.isRead) {
        const bool isDecided = reading.decision.verdict != booleq::Verdict::Undecided;
        comparedAll = py::bool_(isDecided);
        if (isDecided)
            same = py::bool_(reading.decision.IsEqual());
    } else {
        refusal = Decode(reading.fault);
    }
    return ResultClass("Reading")("notation"_a = reading.notation, "reads"_a = reading.isRead,
                                  "refusal"_a = refusal, "same"_a = same,
                                  "compared_all"_a = comparedAll, "hex"_a = OrNone(reading.hex),
                                  "difference"_a = DifferenceOf(report, reading));
}

py::object FindingOf(const booleq::Finding& finding)
{
    py::list details;
    for (const auto& detail : finding.details)
        details.append(py::make_tuple(Decode(detail.first), Decode(detail.second)));
    return ResultClass("Finding")("code"_a = finding.code, "message"_a = Decode(finding.message),
                                  "details"_a = py::tuple(details));
}

py::object LintEquation(const py::object& self, double seconds)
{
    const Equation& equation = Own(self);
    const SharedContent content = equation.Shared();
    const std::string text = Encode(py::reinterpret_borrow<py::str>(equation.Text()));
    const booleq::Reading reading = equation.GetReading();
    const booleq::LintReport report =
        RunLong(equation.GetLength(), [text, content, reading, seconds] {
            return booleq::Lint(text, content->equation, reading, {seconds});
        });
    py::list readers;
    for (const booleq::ForeignReading& read : report.readings)
        readers.append(ReadingOf(report, read));
    py::list findings;
    for (const booleq::Finding& finding : report.findings)
        findings.append(FindingOf(finding));
    return ResultClass("LintReport")(
        "inputs"_a = equation.Inputs(), "grouping"_a = Decode(report.grouping),
        "readers"_a = py::tuple(readers), "findings"_a = py::tuple(findings),
        "is_clean"_a = report.IsClean());
}

} // namespace

void BindReports(py::module_& module)
{
    module.def("tree", &Tree);
    module.def("tree_dot", &TreeDot);
    module.def("explain", &Explain);
    module.def("kmap", &KarnaughMap);
    module.def("lint", &LintEquation);
}

} // namespace booleq_python
