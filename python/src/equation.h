// What Python holds: a set equation that never changes, with the text and the inputs that it was
// made of. It is the base of booleq.Equation, in a type of our own: a million of them are made at
// once, and two hundred nanoseconds for each would count.
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
// Invariant: the equation is set, all values are 0.
struct Content {
    Kq_BoolEquation equation;
    size_t NumInputs() const { return equation.GetVariables().size(); }
    bool IsInit() const { return !equation.IsExpression(); }
};
typedef std::shared_ptr<const Content> SharedContent;

// The value of the equation, which may be a copy, for values of its inputs in their order.
unsigned int ValueOf(Kq_BoolEquation& equation, const std::vector<unsigned int>& values);

// Invariants:
// 1. A given list of inputs is a tuple of plain str, legal names, none twice; otherwise None.
// 2. What is made on demand is made under the interpreter's lock.
// 3. Without content it is of a text that is accepted, and not large: one of very many that were
// read to see that, and whose trees would fill the memory. It is read again when asked for.
class Equation {
  public:
    // 'content' may be null, see invariant 3.
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
    // How long answers take that go through the text, all rows, or the tree of an init value.
    Length GetLength() const;

    // 0 or 1 for values of the inputs in their order, each 0 or 1.  Cost: of an init value that of
    // setting the inputs, however many rows there are.
    unsigned int Evaluate(const std::vector<unsigned int>& values) const;

    // The same text but for spelling, or the same digits, over the same inputs in the same order.
    bool IsSame(const Equation& other) const;
    // Below, 0 or above 0, as in sorting; 0 for what is the same.
    int Compare(const Equation& other) const;
    size_t Hash() const;

  private:
    const SharedContent& ReadAgain() const;

    mutable SharedContent m_content;
    py::object m_text;
    py::object m_given_inputs;
    mutable py::object m_inputs; // null until asked for
    bool m_lsb_first;
    mutable bool m_has_hash = false;
    mutable size_t m_hash = 0;
    mutable std::unique_ptr<Kq_BoolEquation> m_scratch; // whose variables are set
};

// The names of an iterable as a tuple of plain str.
// Fails: TypeError, and ValueError for what is not a legal name or is listed twice.
py::tuple RequireInputs(const py::object& inputs);

// Characters of a text that takes some ten microseconds.
constexpr size_t kLargeText = 2000;
// How long reading or writing a text of so many takes.
Length LengthOfText(size_t numCharacters);

// How a text is read that Python gives with these inputs, a tuple or None.
booleq::Reading ReadingOf(const py::object& givenInputs, bool lsbFirst);

// Reads a text.  Fails: booleq.ParseError.
py::object ReadEquation(const py::str& text, const py::object& givenInputs, bool lsbFirst);
// Takes arguments of any type.  Fails: TypeError, ValueError.
py::object MakeEquation(const py::object& text, const py::object& inputs,
                        const py::object& lsbFirst);
// A new object of booleq.Equation.
py::object Wrap(Equation equation);

bool IsEquation(const py::handle& value);
// Requires: it is one.
const Equation& Own(const py::handle& value);
// Fails: TypeError that begins with 'what'.
const Equation& RequireEquation(const py::handle& value, const char* what);
// An equation, or a text, 0 or 1 as one.  Fails: null for another type; booleq.ParseError.
py::object ToEquation(const py::handle& value);

// The results; 'isReversed' takes the first input for bit 0 of the row's number.
// Fails: ValueError for more than 30 inputs; what a signal's handler raises.
booleq::Rows RowsOf(const Equation& equation, bool isReversed = false);
kq_logic::Function FunctionOf(const Equation& equation);

// 'value' as 0 or 1.  Fails: TypeError, ValueError, what its __index__ raises.
unsigned int RequireBit(const py::handle& value, const py::handle& name);
// The same for what may be something else: false, and no exception, for that.
bool IsBit(const py::handle& value, unsigned int& bit);

// Adds the type, which booleq.Equation is derived from.
void BindCore(py::module_& module);
// The class of which objects are made.
void SetEquationClass(const py::object& type);

} // namespace booleq_python

#endif
