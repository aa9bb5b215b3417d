// Values of inputs as a mapping, and the result for them.
#include <string>
#include <utility>
#include <vector>

#include "bind.h"
#include "text.h"
#include "unicode.h"

namespace booleq_python {

namespace {

typedef std::vector<std::pair<size_t, unsigned int>> Assignment;

// Sets inputs, and gives them their old values back in the end.
class Assigned {
  public:
    Assigned(Equation& equation, const Assignment& assignment) : m_equation(equation)
    {
        m_old.reserve(assignment.size());
        for (const auto& item : assignment) {
            m_old.emplace_back(item.first, equation.GetValue(item.first));
            equation.SetValue(item.first, item.second);
        }
    }
    ~Assigned()
    {
        for (auto item = m_old.rbegin(); item != m_old.rend(); ++item)
            m_equation.SetValue(item->first, item->second);
    }
    Assigned(const Assigned&) = delete;
    Assigned& operator=(const Assigned&) = delete;

  private:
    Equation& m_equation;
    Assignment m_old;
};

void AddItem(const Equation& equation, const py::handle& name, const py::handle& value,
             Assignment& assignment)
{
    const size_t input = equation.FindInput(name);
    assignment.emplace_back(input, RequireBit(value, name));
}

// The one argument by position is taken by hand, so that every name may be an input's.
unsigned int Call(Equation& equation, const py::args& arguments, const py::kwargs& named)
{
    if (arguments.size() > 1)
        throw py::type_error("values are one mapping, or named: " +
                             booleq::Count(arguments.size(), "mapping") + " given");
    Assignment assignment;
    const py::object values = arguments.empty() ? py::none() : py::object(arguments[0]);
    if (!values.is_none()) {
        if (PyUnicode_Check(values.ptr()) || !PyMapping_Check(values.ptr()) ||
            !py::hasattr(values, "items"))
            throw py::type_error("values must be a mapping of names to 0 and 1, not " +
                                 std::string(Py_TYPE(values.ptr())->tp_name));
        const py::list items(values.attr("items")());
        for (const py::handle item : items) {
            if (!PyTuple_Check(item.ptr()) || py::len(item) != 2)
                throw py::type_error("items of values must be pairs, not " + Shown(item));
            const auto pair = py::reinterpret_borrow<py::tuple>(item);
            if (named.contains(pair[0]))
                throw py::type_error("the value of " + Shown(pair[0]) + " is given twice");
            AddItem(equation, pair[0], pair[1], assignment);
        }
    }
    for (const auto& item : named)
        AddItem(equation, item.first, item.second, assignment);
    const Assigned assigned(equation, assignment);
    return equation.Get().Eval();
}

py::object View(const char* name, const py::object& self)
{
    return py::module_::import("collections.abc").attr(name)(self);
}

void BindItems(EquationClass& type)
{
    type.def(
        "__getitem__",
        [](const Equation& self, const py::object& name) {
            return self.GetValue(self.FindInput(name));
        },
        R"doc(__getitem__($record, self, name, /)
--

The value of an input, 0 or 1. KeyError for what is no input.

>>> from booleq import Equation
>>> eq = Equation("A & B")
>>> eq["A"] = 1
>>> eq["A"], eq["B"], dict(eq)
(1, 0, {'A': 1, 'B': 0})
>>> eq["C"]
Traceback (most recent call last):
    ...
KeyError: 'there is no input C; the inputs are A, B'
)doc");
    type.def(
        "__setitem__",
        [](Equation& self, const py::object& name, const py::object& value) {
            const size_t input = self.FindInput(name);
            self.SetValue(input, RequireBit(value, name));
        },
        "__setitem__($record, self, name, value, /)\n--\n\nSets an input to 0, 1, False or True.");
    type.def("__contains__", &Equation::HasInput,
             "__contains__($record, self, name, /)\n--\n\nIs that an input's name.");
    type.def(
        "__iter__", [](const Equation& self) { return py::iter(self.Inputs()); },
        "__iter__($record, self, /)\n--\n\nThe names of the inputs in their order.");
    type.def("__len__", &Equation::NumInputs,
             "__len__($record, self, /)\n--\n\nThe number of inputs.");
    type.def(
        "__bool__", [](const Equation&) { return true; },
        "__bool__($record, self, /)\n--\n\nAlways True, also without inputs.");
}

void BindViews(EquationClass& type)
{
    type.def(
        "keys", [](const py::object& self) { return View("KeysView", self); },
        "keys($record, self, /)\n--\n\nThe names of the inputs, as dict.keys() does it.");
    type.def(
        "values", [](const py::object& self) { return View("ValuesView", self); },
        "values($record, self, /)\n--\n\nThe values of the inputs, as dict.values() does it.");
    type.def(
        "items", [](const py::object& self) { return View("ItemsView", self); },
        "items($record, self, /)\n--\n\nNames and values of the inputs, as dict.items() does it.");
    type.def(
        "get",
        [](const Equation& self, const py::object& name, const py::object& fallback) -> py::object {
            return self.HasInput(name) ? py::int_(self.GetValue(self.FindInput(name))) : fallback;
        },
        py::arg("name"), py::arg("default") = py::none(), py::pos_only(),
        "get($record, self, name, default=None, /)\n--\n\nThe value of an input, or the default.");
}

} // namespace

void BindMapping(EquationClass& type)
{
    BindItems(type);
    BindViews(type);
    type.def("__call__", &Call,
             R"doc(__call__($record, self, values=None, /, **named)
--

The result, 0 or 1, for these values. An input that is not given has the value that is set.

Nothing is set by it. KeyError for what is no input, TypeError for a name that is given twice. Names
that are no words of Python go through a mapping.

>>> from booleq import Equation
>>> eq = Equation("A & 'B[0]'")
>>> eq(A=1), eq({"'B[0]'": 1}, A=1)
(0, 1)
)doc");
}

} // namespace booleq_python
