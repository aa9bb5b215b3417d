#include "equation.h"

#include <algorithm>
#include <functional>

#include "errors.h"
#include "expression.h"
#include "messages.h"
#include "permute.h"
#include "text.h"
#include "unicode.h"
#include "watch.h"

namespace booleq_python {

namespace {

constexpr size_t kMaxListedInputs = 20;

// The name by which the library knows a variable, for as long as the table is long enough: a handle
// is a cached number, so one is enough for all variables of all equations.
Kq_BoolEquation::Handle HandleOf(size_t input)
{
    static const Kq_BoolEquation::Handle first = Kq_BoolEquation("A").GetVariableHandle("A");
    Kq_BoolEquation::Handle handle = first;
    *handle.begin() = static_cast<unsigned int>(input);
    return handle;
}

size_t Mix(size_t hash, size_t value)
{
    return (hash ^ value) * 0x9e3779b97f4a7c15u + (hash >> 29);
}

} // namespace

py::tuple RequireInputs(const py::object& inputs)
{
    py::tuple names = RequireNames(inputs);
    const std::vector<std::string> encoded = EncodeAll(names);
    // The library would read such a name up to the NUL.
    for (const std::string& name : encoded)
        if (name.find('\0') != std::string::npos)
            throw py::value_error("inputs: '" + booleq::Excerpt(name) + "' is no name");
    const std::string fault = booleq::OrderFault(encoded);
    if (!fault.empty())
        throw py::value_error("inputs: " + fault);
    return names;
}

Equation::Equation(const py::object& text, const py::object& inputs, const py::object& lsbFirst)
    : m_text(RequireStr(text, "text")),
      m_given_inputs(inputs.is_none() ? inputs : RequireInputs(inputs)),
      m_lsb_first(RequireFlag(lsbFirst, "lsb_first"))
{
    const std::string bytes = Encode(m_text);
    const booleq::Reading reading = GetReading();
    const booleq::NoMessages silence;
    if (bytes.find('\0') != std::string::npos || !SetFromText(m_equation, bytes, reading))
        RaiseParseError(m_text, booleq::ExplainRefusal(bytes, reading));
    m_inputs = DecodeAll(InputBytes());
    for (size_t input = 0; input < m_inputs.size(); ++input)
        m_numbers[m_inputs[input]] = input;
}

void* Equation::operator new(size_t /*size*/)
{
    throw py::type_error("this Equation was made without a text: Equation.__init__ did not run");
}

booleq::Reading Equation::GetReading() const
{
    booleq::Reading reading;
    reading.inputsName = "inputs=";
    reading.lsbFirst = m_lsb_first;
    reading.hasInputs = !m_given_inputs.is_none();
    if (reading.hasInputs)
        reading.inputs = EncodeAll(py::reinterpret_borrow<py::tuple>(m_given_inputs));
    return reading;
}

std::vector<std::string> Equation::InputBytes() const
{
    std::vector<std::string> names;
    names.reserve(NumInputs());
    for (const auto& variable : m_equation.GetVariables())
        names.push_back(booleq::ToStd(variable.first));
    return names;
}

size_t Equation::FindInput(const py::handle& name) const
{
    const py::object number = FindNumber(name);
    if (number)
        return number.cast<size_t>();
    std::string listed;
    for (size_t input = 0; input < std::min(NumInputs(), kMaxListedInputs); ++input)
        listed += (input == 0 ? "" : ", ") +
                  booleq::Excerpt(booleq::ToStd(m_equation.GetVariables()[input].first));
    if (NumInputs() > kMaxListedInputs)
        listed += " and " + std::to_string(NumInputs() - kMaxListedInputs) + " more";
    throw py::key_error("there is no input " + Shown(name) +
                        (listed.empty() ? "; there are none" : "; the inputs are " + listed));
}

bool Equation::HasInput(const py::handle& name) const
{
    return static_cast<bool>(FindNumber(name));
}

// Null for what is no input. Strs that stand for the same bytes are one name: escaped bytes that
// together are UTF-8 are listed as the character.
py::object Equation::FindNumber(const py::handle& name) const
{
    PyObject* number = PyDict_GetItemWithError(m_numbers.ptr(), name.ptr());
    if (!number && !PyErr_Occurred() && PyUnicode_Check(name.ptr()) &&
        !PyUnicode_IS_ASCII(name.ptr())) {
        const py::object same = SameInBytes(py::reinterpret_borrow<py::str>(name));
        if (same)
            number = PyDict_GetItemWithError(m_numbers.ptr(), same.ptr());
    }
    if (!number && PyErr_Occurred())
        throw py::error_already_set();
    return py::reinterpret_borrow<py::object>(number);
}

void Equation::SetValue(size_t input, unsigned int value)
{
    m_equation.SetVariable(HandleOf(input), value);
}

// Equal equations have equal trees, or equal init values; their variables may differ in order.
size_t Equation::Hash() const
{
    if (m_has_hash)
        return m_hash;
    const std::hash<std::string> hashText;
    size_t hash = 1;
    if (!m_equation.IsExpression()) {
        hash = hashText(booleq::ToStd(m_equation.GetEquation(false)));
    } else {
        const booleq::Expression expression = booleq::ToExpression(m_equation);
        std::vector<size_t> names;
        for (const std::string& name : expression.names)
            names.push_back(hashText(name));
        for (const booleq::Expression::Node& node : expression.nodes)
            hash = Mix(hash, node.op == booleq::Operator::Input ? names[node.left]
                                                                : static_cast<size_t>(node.op));
    }
    m_hash = hash;
    m_has_hash = true;
    return m_hash;
}

booleq::Rows RowsOf(const Equation& equation)
{
    booleq::Rows rows;
    if (!booleq::RowsOf(equation.Get(), rows))
        throw py::value_error(booleq::NoFunctionReason(equation.NumInputs()));
    return rows;
}

kq_logic::Function FunctionOf(const Equation& equation)
{
    kq_logic::Function function;
    if (!function.Set(equation.Get()))
        throw py::value_error(booleq::NoFunctionReason(equation.NumInputs()));
    return function;
}

unsigned int RequireBit(const py::handle& value, const py::handle& name)
{
    const auto fault = [&] {
        return "the value of " + Shown(name) + " must be 0 or 1, not " + Shown(value);
    };
    py::object number = py::reinterpret_borrow<py::object>(value);
    if (!PyLong_Check(value.ptr())) {
        // NumPy's bool is no index.
        if (py::isinstance(value, py::module_::import("numpy").attr("bool_")))
            number = py::bool_(number);
        number = py::reinterpret_steal<py::object>(PyNumber_Index(number.ptr()));
        if (!number) {
            PyErr_Clear();
            throw py::type_error(fault());
        }
    }
    if (number.equal(py::int_(0)))
        return 0;
    if (number.equal(py::int_(1)))
        return 1;
    throw py::value_error(fault());
}

} // namespace booleq_python
