// What Python holds: a set equation with the text and the inputs that it was made of.
#ifndef BOOLEQ_PYTHON_EQUATION_H
#define BOOLEQ_PYTHON_EQUATION_H

#include <cstddef>
#include <cstdint>
#include <memory>
#include <string>
#include <vector>

#include <pybind11/pybind11.h>

#include <Kq_BoolEquation.h>
#include <kq_logic/function.h>

#include "function.h"
#include "listed_inputs.h"

namespace booleq_python {

namespace py = pybind11;

// The names of an iterable as a tuple of plain str.
// Fails: TypeError, and ValueError for what is no legal name or is listed twice.
py::tuple RequireInputs(const py::object& inputs);

// Invariants:
// 1. The equation is set, and only values of its variables change.
// 2. A given list of inputs is a tuple of plain str, legal names, none twice.
class Equation {
  public:
    // 'inputs' is None or an iterable of names.
    // Fails: booleq.ParseError; TypeError and ValueError for what is no text or no list of names.
    Equation(const py::object& text, const py::object& inputs, const py::object& lsbFirst);

    Equation(const Equation& other) = default;
    Equation& operator=(const Equation& other) = delete;
    ~Equation() = default;

    // The binding asks for memory here when somebody uses an object whose __init__ never ran.
    // Others are made by MakeEquation.  Fails: TypeError, always.
    static void* operator new(size_t size);
    static void operator delete(void* memory) { ::operator delete(memory); }

    const Kq_BoolEquation& Get() const { return m_equation; }
    const py::str& Text() const { return m_text; }
    const py::object& GivenInputs() const { return m_given_inputs; }
    bool IsLsbFirst() const { return m_lsb_first; }
    // How the text was read.
    booleq::Reading GetReading() const;

    size_t NumInputs() const { return m_equation.GetVariables().size(); }
    const py::tuple& Inputs() const { return m_inputs; }
    std::vector<std::string> InputBytes() const;
    // The input's number.  Fails: KeyError that says which inputs there are.
    size_t FindInput(const py::handle& name) const;
    bool HasInput(const py::handle& name) const;
    unsigned int GetValue(size_t input) const { return m_equation.GetVariables()[input].second; }
    void SetValue(size_t input, unsigned int value);

    // Equal for equations that the library takes for equal.  Cost: in step with the equation, once.
    size_t Hash() const;

  private:
    py::object FindNumber(const py::handle& name) const;

    Kq_BoolEquation m_equation;
    py::str m_text;
    py::object m_given_inputs; // None without a list
    bool m_lsb_first;
    py::tuple m_inputs;
    py::dict m_numbers; // of inputs, by name
    mutable bool m_has_hash = false;
    mutable size_t m_hash = 0;
};

// A new one for Python to own, of the arguments of a constructor.
template <class... Arguments>
std::unique_ptr<Equation> MakeEquation(const Arguments&... arguments)
{
    return std::unique_ptr<Equation>(::new Equation(arguments...));
}

// Fails: ValueError for more than 30 inputs; what a signal's handler raises.
booleq::Rows RowsOf(const Equation& equation);
kq_logic::Function FunctionOf(const Equation& equation);

// 'value' as 0 or 1.  Fails: TypeError, ValueError.
unsigned int RequireBit(const py::handle& value, const py::handle& name);

} // namespace booleq_python

#endif
