// What Python holds: a set equation that never changes, with the text and the inputs from which it
// was made. Its type, the base of booleq.Equation, is written by hand: a program may make a million
// equations at once, so 200 nanoseconds for each would matter.
#ifndef BOOLEQ_PYTHON_EQUATION_H
#define BOOLEQ_PYTHON_EQUATION_H

#include <cstddef>
#include <cstdint>
#include <memory>
#include <string>
#include <utility>
#include <vector>

#include <pybind11/pybind11.h>

#include <Kq_BoolEquation.h>
#include <kq_logic/function.h>

#include "expression.h"
#include "function.h"
#include "listed_inputs.h"
#include "lock.h"

namespace booleq_python {

namespace py = pybind11;

// Shared with threads that work on it without the interpreter's lock.
// Invariant: the equation is set, and all values are 0.
struct Content {
    Kq_BoolEquation equation;
    size_t NumInputs() const { return equation.GetVariables().size(); }
    bool IsInit() const { return !equation.IsExpression(); }
};
typedef std::shared_ptr<const Content> SharedContent;

// The value of the equation, which is changed and may be a copy, for values of its inputs in their
// order.
unsigned int ValueOf(Kq_BoolEquation& equation, const std::vector<unsigned int>& values);

// Invariants:
// 1. m_given_inputs is None or a tuple of plain str: legal names, each different.
// 2. Mutable members are set under the interpreter's lock.
// 3. Without content, the text is accepted and not large. It is one of very many that were read to
//    check them, and whose trees would fill the memory. The text is read again on demand.
class Equation {
  public:
    // 'content' may be null; see invariant 3.
    Equation(SharedContent content, py::object text, py::object givenInputs, bool lsbFirst)
        : m_content(std::move(content)), m_text(std::move(text)),
          m_given_inputs(std::move(givenInputs)), m_lsb_first(lsbFirst)
    {
    }

    const Kq_BoolEquation& Get() const { return Shared()->equation; }
    const SharedContent& Shared() const { return m_content ? m_content : ReadAgain(); }
    bool IsInit() const { return Shared()->IsInit(); }
    size_t NumInputs() const { return Shared()->NumInputs(); }

    const py::object& Text() const { return m_text; }
    const py::object& GivenInputs() const { return m_given_inputs; }
    bool IsLsbFirst() const { return m_lsb_first; }
    // How the text was read.
    booleq::Reading GetReading() const;
    // A tuple of str.
    const py::object& Inputs() const;
    std::vector<std::string> InputBytes() const;
    bool IsLargeText() const;
    // How long an answer takes that goes through the text, all rows, or the tree of an init value.
    Length GetLength() const;

    // 0 or 1 for values of the inputs in their order, each 0 or 1.  Cost: for an init value, that
    // of setting the inputs, however many rows there are.
    unsigned int Evaluate(const std::vector<unsigned int>& values) const;

    // The same text except for spelling, or the same digits, over the same inputs in the same
    // order.
    bool IsSame(const Equation& other) const;
    // Below, equal to or above 0, as for sorting; 0 if IsSame.
    int Compare(const Equation& other) const;
    size_t Hash() const;

  private:
    const SharedContent& ReadAgain() const;

    mutable SharedContent m_content;
    py::object m_text;
    py::object m_given_inputs;
    mutable py::object m_inputs; // null until needed
    bool m_lsb_first;
    mutable bool m_has_hash = false;
    mutable size_t m_hash = 0;
    mutable std::unique_ptr<Kq_BoolEquation> m_scratch; // variables are set in this copy
};

// The names of an iterable as a tuple of plain str.
// Fails: TypeError, and ValueError for a name that is not legal or is listed twice.
py::tuple RequireInputs(const py::object& inputs);

// Texts of more characters are large; one of this length takes some ten microseconds.
constexpr size_t kLargeText = 2000;
// How long reading or writing a text of so many characters takes.
Length LengthOfText(size_t numCharacters);

// How to read a text given with these inputs, a tuple or None.
booleq::Reading ReadingOf(const py::object& givenInputs, bool lsbFirst);

// Reads a text.  Fails: booleq.ParseError.
py::object ReadEquation(const py::str& text, const py::object& givenInputs, bool lsbFirst);
// Takes arguments of any type.  Fails: TypeError, ValueError.
py::object MakeEquation(const py::object& text, const py::object& inputs,
                        const py::object& lsbFirst);
// A new object of booleq.Equation.
py::object Wrap(Equation equation);

bool IsEquation(const py::handle& value);
// Requires: 'value' is an Equation.
const Equation& Own(const py::handle& value);
// Fails: TypeError that begins with 'what'.
const Equation& RequireEquation(const py::handle& value, const char* what);
// An equation, or a text, 0 or 1 as an equation.  Fails: null for another type; booleq.ParseError.
py::object ToEquation(const py::handle& value);

// The results; with 'isReversed' the first input is bit 0 of the row's number.
// Fails: ValueError for more than 30 inputs; what a signal handler raises.
booleq::Rows RowsOf(const Equation& equation, bool isReversed = false);
kq_logic::Function FunctionOf(const Equation& equation);

// 'value' as 0 or 1.  Fails: TypeError, ValueError, what its __index__ raises.
unsigned int RequireBit(const py::handle& value, const py::handle& name);
// The same, but false instead of an exception for anything else, except what __index__ raises.
bool IsBit(const py::handle& value, unsigned int& bit);

// Adds the type from which booleq.Equation is derived.
void BindCore(py::module_& module);
// Sets the class of new objects.
void SetEquationClass(const py::object& type);

} // namespace booleq_python

#endif
