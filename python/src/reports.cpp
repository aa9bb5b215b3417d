// Trees, comparison, permutation and what the searches find, as the plain values of _results.py.
#include <string>
#include <vector>

#include <kq_logic/decide.h>
#include <kq_logic/explain.h>
#include <kq_logic/permute.h>
#include <kq_logic/short_form.h>

#include "bind.h"
#include "errors.h"
#include "lint.h"
#include "permute.h"
#include "text.h"
#include "tree.h"
#include "unicode.h"

namespace booleq_python {

namespace {

using namespace pybind11::literals; // "name"_a

// A tree that is too large to look at is not drawn.
constexpr size_t kMaxShownNodes = 300;
constexpr size_t kMaxShownText = 10000;
constexpr size_t kMaxShownInitInputs = 5;

constexpr double kLintSeconds = 10; // for each reader

py::object Link(size_t index)
{
    if (index == booleq::TreeList::kNoNode)
        return py::none();
    return py::int_(index);
}

py::list Tree(const Equation& equation)
{
    const py::object node = ResultClass("Node");
    const booleq::TreeList list(equation.Get());
    py::list nodes;
    for (size_t index = 0; index < list.Entries().size(); ++index) {
        const booleq::TreeList::Entry& entry = list.Entries()[index];
        nodes.append(node(index, Decode(list.TypeName(index)), Decode(list.Token(index)),
                          Link(entry.parent), Link(entry.left), Link(entry.right)));
        CheckSignals();
    }
    return nodes;
}

std::string TreeDot(const booleq::TreeList& list)
{
    std::string dot;
    PutDot(list, [&dot](const std::string& piece) {
        dot += piece;
        CheckSignals();
    });
    return dot;
}

py::object ReprSvg(const Equation& equation)
{
    const bool isInit = !equation.Get().IsExpression();
    if (isInit ? equation.NumInputs() > kMaxShownInitInputs
               : py::len(equation.Text()) > kMaxShownText)
        return py::none();
    const booleq::TreeList list(equation.Get());
    if (list.Entries().size() > kMaxShownNodes)
        return py::none();
    return py::module_::import("booleq._display").attr("svg")(TreeDot(list));
}

py::object Equivalent(const Equation& equation, const py::object& otherObject)
{
    if (!py::isinstance<Equation>(otherObject))
        throw py::type_error("other must be an Equation, not " +
                             std::string(Py_TYPE(otherObject.ptr())->tp_name));
    const auto& other = otherObject.cast<const Equation&>();
    const kq_logic::Decision decision = kq_logic::DecideEqual(equation.Get(), other.Get());
    if (decision.verdict == kq_logic::Verdict::Undecided)
        throw py::value_error("not decided: " + decision.reason);
    const bool isEqual = decision.verdict == kq_logic::Verdict::Equal;
    py::object counterexample = py::none();
    py::object values = py::none();
    if (!isEqual) {
        counterexample = py::dict();
        for (size_t input = 0; input < decision.inputs.size(); ++input)
            counterexample[Decode(decision.inputs[input])] = decision.assignment[input] ? 1 : 0;
        values = py::make_tuple(decision.left ? 1 : 0, decision.right ? 1 : 0);
    }
    return ResultClass("Equivalence")(isEqual, counterexample, values);
}

std::unique_ptr<Equation> Permute(const Equation& equation, const py::object& inputs)
{
    const py::tuple names = RequireInputs(inputs);
    const std::vector<std::string> order = EncodeAll(names);
    if (order.size() > booleq::kMaxPermuteInputs)
        throw py::value_error("inputs has " + booleq::Count(order.size(), "input") + ": at most " +
                              std::to_string(booleq::kMaxPermuteInputs));
    const std::string forgotten = booleq::FirstUnlisted(equation.InputBytes(), order);
    if (!forgotten.empty())
        throw py::value_error("inputs does not list " + booleq::Excerpt(forgotten));
    kq_logic::Function function;
    const std::string fault = kq_logic::Permute(FunctionOf(equation), order, function);
    if (!fault.empty())
        throw py::value_error(fault);
    // A constant has no init value; over one input only the binary form reads back.
    if (order.empty())
        return MakeEquation(py::str(function.At(0) ? "1" : "0"), names, py::bool_(false));
    return MakeEquation(py::str(order.size() == 1 ? function.Binary() : function.Hex()), names,
                        py::bool_(false));
}

// The text, or None where it is empty.
py::object OrNone(const std::string& text)
{
    if (text.empty())
        return py::none();
    return Decode(text);
}

py::object Explain(const Equation& equation)
{
    const kq_logic::Function function = FunctionOf(equation);
    const kq_logic::Explanation explanation = kq_logic::Explain(function);
    if (!explanation.fault.empty())
        throw py::value_error(explanation.fault);
    const kq_logic::ShortForm shortForm = kq_logic::FindShortForm(function);
    const py::object operands =
        shortForm.fault.empty() ? py::object(py::int_(shortForm.numOperands)) : py::none();
    return ResultClass("Explanation")(
        "inputs"_a = equation.Inputs(), "hex"_a = function.Hex(), "binary"_a = function.Binary(),
        "without_effect"_a = DecodeAll(explanation.idle), "kind"_a = OrNone(explanation.kind),
        "function"_a = explanation.kind.empty() ? py::none() : py::object(Decode(explanation.text)),
        "expression"_a = OrNone(shortForm.text), "operands"_a = operands,
        "minimal"_a = shortForm.isMinimal);
}

py::object DifferenceOf(const booleq::LintReport& report, const booleq::ForeignReading& reading)
{
    if (!reading.decision.IsDifferent())
        return py::none();
    py::dict assignment;
    for (size_t input = 0; input < report.inputs.size(); ++input)
        assignment[Decode(report.inputs[input])] = reading.decision.assignment[input] ? 1 : 0;
    return ResultClass("Difference")(
        "assignment"_a = assignment, "here"_a = reading.decision.left ? 1 : 0,
        "grouping"_a = Decode(reading.grouping), "reason"_a = Decode(reading.reason),
        "write_there"_a = Decode(reading.textThere), "write_here"_a = OrNone(reading.textHere));
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
    py::dict details;
    for (const auto& detail : finding.details)
        details[Decode(detail.first)] = Decode(detail.second);
    return ResultClass("Finding")("code"_a = finding.code, "message"_a = Decode(finding.message),
                                  "details"_a = details);
}

py::object LintEquation(const Equation& equation)
{
    const booleq::LintReport report = booleq::Lint(Encode(equation.Text()), equation.Get(),
                                                   equation.GetReading(), {kLintSeconds});
    py::list readers;
    for (const booleq::ForeignReading& reading : report.readings)
        readers.append(ReadingOf(report, reading));
    py::list findings;
    for (const booleq::Finding& finding : report.findings)
        findings.append(FindingOf(finding));
    return ResultClass("LintReport")(
        "inputs"_a = equation.Inputs(), "grouping"_a = Decode(report.grouping),
        "readers"_a = py::tuple(readers), "findings"_a = py::tuple(findings),
        "is_clean"_a = report.IsClean());
}

void BindTrees(EquationClass& type)
{
    type.def("tree", &Tree,
             R"doc(tree($record, self)
--

The nodes of the expression tree in pre-order, as a flat list: texts decide the depth.

>>> from booleq import Equation
>>> for node in Equation("a | b").tree():
...     print(node)
Node(id=0, type='OR', token='|', parent=None, left=1, right=2)
Node(id=1, type='ID', token='a', parent=0, left=None, right=None)
Node(id=2, type='ID', token='b', parent=0, left=None, right=None)
)doc");
    type.def(
        "tree_dot", [](const Equation& self) { return TreeDot(booleq::TreeList(self.Get())); },
        "tree_dot($record, self)\n--\n\nThe tree as a graph for Graphviz.");
    type.def("_repr_svg_", &ReprSvg,
             "_repr_svg_($record, self)\n--\n\nThe tree as a picture for notebooks; None without "
             "Graphviz's dot, or for a tree that is too large to look at.");
    type.def(
        "_repr_html_",
        [](const py::object& self) {
            return py::module_::import("booleq._display").attr("html")(self);
        },
        "_repr_html_($record, self)\n--\n\nText and truth table for notebooks, 64 rows at most.");
}

} // namespace

void BindReports(EquationClass& type)
{
    BindTrees(type);
    type.def("equivalent", &Equivalent, py::arg("other"),
             R"doc(equivalent($record, self, other)
--

Whether both are one function of their inputs, by name; if not, the first row that differs.

With more than 30 inputs together it is one of them. ValueError where a module built without a
solver cannot tell.

>>> from booleq import Equation
>>> Equation("a | b & c").equivalent(Equation("a | (b & c)"))
Equivalence(equal=False, counterexample={'a': 1, 'b': 0, 'c': 0}, values=(0, 1))
)doc");
    type.def("permute", &Permute, py::arg("inputs"),
             R"doc(permute($record, self, inputs)
--

The same function over another order of its inputs, as an equation of its init value.

Names that the equation does not have widen it. At most 24 inputs.

>>> from booleq import Equation
>>> Equation("0xca", ["S", "A", "B"]).permute(["A", "B", "S"])
Equation('0xe4', inputs=['A', 'B', 'S'])
)doc");
    type.def("explain", &Explain,
             R"doc(explain($record, self)
--

What the function is: its name, inputs without effect, a short expression.

ValueError for more than 16 inputs.

>>> from booleq import Equation
>>> Equation("0xca", ["S", "A", "B"]).explain().function
'multiplexer, select S: A for S=1; B for S=0'
)doc");
    type.def("lint", &LintEquation,
             R"doc(lint($record, self)
--

Who reads the text as another function, and where the library itself surprises.

>>> from booleq import Equation
>>> report = Equation("a | b & c").lint()
>>> report.is_clean, [reader.notation for reader in report.readers if reader.same is False]
(False, ['Verilog', 'C', 'Liberty', 'Python'])
)doc");
}

} // namespace booleq_python
