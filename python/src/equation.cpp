#include "equation.h"

#include <algorithm>
#include <cassert>
#include <cstring>
#include <functional>
#include <utility>

#include "errors.h"
#include "lock.h"
#include "messages.h"
#include "notation_writer.h"
#include "permute.h"
#include "text.h"
#include "unicode.h"
#include "watch.h"

namespace booleq_python {

namespace {

size_t Mix(size_t hash, size_t value)
{
    return (hash ^ value) * 0x9e3779b97f4a7c15u + (hash >> 29);
}

size_t HashOf(const Content& content)
{
    const std::hash<std::string> hashText;
    size_t hash = 1;
    std::vector<size_t> names;
    for (const auto& variable : content.equation.GetVariables()) {
        names.push_back(hashText(booleq::ToStd(variable.first)));
        hash = Mix(hash, names.back());
    }
    booleq::Rows rows;
    if (content.IsInit() && booleq::RowsOf(content.equation, rows)) {
        for (size_t word = 0; word < rows.Size(); ++word)
            hash = Mix(hash, static_cast<size_t>(rows.Words()[word]));
        return hash;
    }
    for (const booleq::Expression::Node& node : booleq::ToExpression(content.equation).nodes)
        hash = Mix(hash, node.op == booleq::Operator::Input ? names[node.left]
                                                            : static_cast<size_t>(node.op));
    return hash;
}

bool HaveSameInputs(const Content& left, const Content& right)
{
    const auto& own = left.equation.GetVariables();
    const auto& other = right.equation.GetVariables();
    return std::equal(own.begin(), own.end(), other.begin(), other.end(),
                      [](const auto& mine, const auto& yours) {
                          return mine.first.length() == yours.first.length() &&
                                 std::memcmp(mine.first.c_str(), yours.first.c_str(),
                                             mine.first.length()) == 0;
                      });
}

bool AreSame(const Content& left, const Content& right)
{
    if (left.IsInit() != right.IsInit() || !HaveSameInputs(left, right))
        return false;
    booleq::Rows own;
    booleq::Rows other;
    if (left.IsInit() && booleq::RowsOf(left.equation, own) &&
        booleq::RowsOf(right.equation, other))
        return own == other;
    return left.equation == right.equation;
}

// The first key for sorting, after the kind: for texts the tokens, for init values the digits, the
// highest row first.
std::string FirstKey(const Content& content)
{
    booleq::Function function;
    if (content.IsInit() && booleq::FunctionOf(content.equation, function))
        return function.Hex();
    return booleq::ToStd(content.equation.GetEquationAlt1(true));
}

// The further keys: for texts the grouping of the tokens, and in both cases the names.
std::vector<std::string> OtherKeys(const Content& content)
{
    std::vector<std::string> keys;
    if (!content.IsInit())
        keys.push_back(WriteOwn(booleq::ToExpression(content.equation), booleq::OwnSyntax::First,
                                booleq::Parentheses::Whole));
    for (const auto& variable : content.equation.GetVariables())
        keys.push_back(booleq::ToStd(variable.first));
    return keys;
}

// Below or above 0.  Requires: the two are not the same.
int Order(const Content& left, const Content& right)
{
    if (left.IsInit() != right.IsInit())
        return right.IsInit() ? -1 : 1;
    const int order = FirstKey(left).compare(FirstKey(right));
    if (order != 0)
        return order;
    const std::vector<std::string> own = OtherKeys(left);
    const std::vector<std::string> other = OtherKeys(right);
    assert(own != other);
    return own < other ? -1 : 1;
}

// Null if the text is refused.
SharedContent Read(const std::string& bytes, const booleq::Reading& reading)
{
    const booleq::NoMessages silence;
    const auto content = std::make_shared<Content>();
    if (bytes.find('\0') != std::string::npos || !SetFromText(content->equation, bytes, reading))
        return nullptr;
    return content;
}

} // namespace

booleq::Reading ReadingOf(const py::object& givenInputs, bool lsbFirst)
{
    booleq::Reading reading;
    reading.inputsName = "inputs=";
    reading.lsbFirst = lsbFirst;
    reading.hasInputs = !givenInputs.is_none();
    if (reading.hasInputs)
        reading.inputs = EncodeAll(py::reinterpret_borrow<py::tuple>(givenInputs));
    return reading;
}

unsigned int ValueOf(Kq_BoolEquation& equation, const std::vector<unsigned int>& values)
{
    assert(values.size() == equation.GetNumVariables());
    // The handle is only a cached number, valid in any equation with so many variables. Asking for
    // one by name would list all places of the name, which makes the tree of an init value.
    static const Kq_BoolEquation::Handle first = Kq_BoolEquation("A").GetVariableHandle("A");
    Kq_BoolEquation::Handle handle = first;
    for (size_t input = 0; input < values.size(); ++input) {
        *handle.begin() = static_cast<unsigned int>(input);
        equation.SetVariable(handle, values[input]);
    }
    return equation.Eval();
}

const SharedContent& Equation::ReadAgain() const
{
    m_content = Read(Encode(py::reinterpret_borrow<py::str>(m_text)), GetReading());
    assert(m_content);
    return m_content;
}

booleq::Reading Equation::GetReading() const
{
    return ReadingOf(m_given_inputs, m_lsb_first);
}

const py::object& Equation::Inputs() const
{
    if (!m_inputs)
        m_inputs = DecodeAll(InputBytes());
    return m_inputs;
}

std::vector<std::string> Equation::InputBytes() const
{
    std::vector<std::string> names;
    names.reserve(NumInputs());
    for (const auto& variable : Get().GetVariables())
        names.push_back(booleq::ToStd(variable.first));
    return names;
}

bool Equation::IsLargeText() const
{
    return static_cast<size_t>(PyUnicode_GET_LENGTH(m_text.ptr())) > kLargeText;
}

Length Equation::GetLength() const
{
    // Numbers of inputs: for more, the rows take longer than a switch of threads, allocating the
    // rows takes a while, or the tree of an init value has some 100,000 nodes or more.
    constexpr size_t kLongRows = 10;
    constexpr size_t kEndlessRows = 22;
    constexpr size_t kEndlessTree = 12;
    const size_t numInputs = NumInputs();
    const bool hasRows = numInputs <= booleq::kMaxFunctionInputs;
    const Length ofText = LengthOfText(static_cast<size_t>(PyUnicode_GET_LENGTH(m_text.ptr())));
    if (hasRows && numInputs > (IsInit() ? kEndlessTree : kEndlessRows))
        return Length::Endless;
    return std::max(ofText, numInputs > kLongRows ? Length::Long : Length::Short);
}

Length LengthOfText(size_t numCharacters)
{
    constexpr size_t kEndlessText = 50000;
    if (numCharacters > kEndlessText)
        return Length::Endless;
    return numCharacters > kLargeText ? Length::Long : Length::Short;
}

unsigned int Equation::Evaluate(const std::vector<unsigned int>& values) const
{
    assert(values.size() == NumInputs());
    if (IsLargeText() && !IsInit()) { // without the lock, so on a copy that no other call uses
        Kq_BoolEquation copy(Get());
        return Freely([&] { return ValueOf(copy, values); });
    }
    if (!m_scratch)
        m_scratch = std::make_unique<Kq_BoolEquation>(Get());
    return ValueOf(*m_scratch, values);
}

bool Equation::IsSame(const Equation& other) const
{
    if (this == &other)
        return true;
    const SharedContent own = Shared(); // keeps them alive while the lock is released
    const SharedContent theirs = other.Shared();
    return own == theirs || Run(std::min(GetLength(), other.GetLength()),
                                [own, theirs] { return AreSame(*own, *theirs); });
}

int Equation::Compare(const Equation& other) const
{
    if (IsSame(other))
        return 0;
    const SharedContent own = Shared();
    const SharedContent theirs = other.Shared();
    CheckSignals(); // sorting calls this very often and checks nowhere else
    return Run(std::max(GetLength(), other.GetLength()),
               [own, theirs] { return Order(*own, *theirs); });
}

size_t Equation::Hash() const
{
    if (!m_has_hash) {
        const SharedContent content = Shared();
        m_hash = Run(GetLength(), [content] { return HashOf(*content); });
        m_has_hash = true;
    }
    return m_hash;
}

py::tuple RequireInputs(const py::object& inputs)
{
    py::tuple names = RequireNames(inputs);
    const std::vector<std::string> encoded = EncodeAll(names);
    // The library would read such a name only up to the NUL.
    for (const std::string& name : encoded)
        if (name.find('\0') != std::string::npos)
            throw py::value_error("inputs: '" + booleq::Excerpt(name) + "' is not a name");
    const std::string fault = booleq::OrderFault(encoded);
    if (!fault.empty())
        throw py::value_error("inputs: " + fault);
    return names;
}

py::object ReadEquation(const py::str& text, const py::object& givenInputs, bool lsbFirst)
{
    const std::string bytes = Encode(text);
    const booleq::Reading reading = ReadingOf(givenInputs, lsbFirst);
    const auto read = [&bytes, &reading] { return Read(bytes, reading); };
    const Length length = LengthOfText(bytes.size());
    const SharedContent content = length == Length::Endless
                                      ? Beside([bytes, reading] { return Read(bytes, reading); })
                                      : Run(length, read);
    if (!content)
        RaiseParseError(text, bytes, reading);
    return Wrap({content, text, givenInputs, lsbFirst});
}

py::object MakeEquation(const py::object& text, const py::object& inputs,
                        const py::object& lsbFirst)
{
    const py::str plain = RequireStr(text, "text");
    const py::object given = inputs.is_none() ? inputs : RequireInputs(inputs);
    return ReadEquation(plain, given, RequireFlag(lsbFirst, "lsb_first"));
}

booleq::Rows RowsOf(const Equation& equation, bool isReversed)
{
    if (equation.NumInputs() > booleq::kMaxFunctionInputs)
        throw py::value_error(booleq::NoFunctionReason(equation.NumInputs()));
    const SharedContent content = equation.Shared();
    return Run(equation.GetLength(), [content, isReversed] {
        booleq::Rows rows;
        booleq::RowsOf(content->equation, rows);
        return isReversed ? ReverseInputs(std::move(rows)) : rows;
    });
}

kq_logic::Function FunctionOf(const Equation& equation)
{
    if (equation.NumInputs() > booleq::kMaxFunctionInputs)
        throw py::value_error(booleq::NoFunctionReason(equation.NumInputs()));
    const SharedContent content = equation.Shared();
    return Run(equation.GetLength(), [content] {
        kq_logic::Function function;
        function.Set(content->equation);
        return function;
    });
}

bool IsBit(const py::handle& value, unsigned int& bit)
{
    PyObject* const object = value.ptr();
    const bool isNumPyBool = std::strncmp(Py_TYPE(object)->tp_name, "numpy.bool", 10) == 0;
    long number = 0;
    if (isNumPyBool) {
        number = PyObject_IsTrue(object);
    } else {
        if (!PyIndex_Check(object))
            return false;
        const auto index = py::reinterpret_steal<py::object>(PyNumber_Index(object));
        if (!index)
            throw py::error_already_set();
        int isBeyond = 0;
        number = PyLong_AsLongAndOverflow(index.ptr(), &isBeyond);
        if (isBeyond != 0)
            return false;
    }
    if (number == -1 && PyErr_Occurred())
        throw py::error_already_set();
    bit = static_cast<unsigned int>(number);
    return number == 0 || number == 1;
}

unsigned int RequireBit(const py::handle& value, const py::handle& name)
{
    unsigned int bit = 0;
    if (IsBit(value, bit))
        return bit;
    const std::string fault =
        "the value of " + Shown(name) + " must be 0 or 1, not " + ShownValue(value);
    if (PyIndex_Check(value.ptr()))
        throw py::value_error(fault);
    throw py::type_error(fault);
}

} // namespace booleq_python
