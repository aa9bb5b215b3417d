// Writes equations as texts and init values, and reads other notations.
#include <algorithm>
#include <string>
#include <vector>

#include <kq_logic/convert.h>
#include <kq_logic/short_form.h>

#include "bind.h"
#include "errors.h"
#include "foreign_text.h"
#include "lock.h"
#include "notation_writer.h"
#include "text.h"
#include "unicode.h"
#include "watch.h"

namespace booleq_python {

namespace {

using namespace pybind11::literals; // "name"_a

typedef Port::StringBase<char> String;

struct Syntax {
    const char* name;
    String (Kq_BoolEquation::*render)(bool spaces) const;
};

constexpr Syntax kSyntaxes[] = {
    {"primary", &Kq_BoolEquation::GetEquation},
    {"alt1", &Kq_BoolEquation::GetEquationAlt1},
    {"alt2", &Kq_BoolEquation::GetEquationAlt2},
    {"alt3", &Kq_BoolEquation::GetEquationAlt3},
    {"expression", &Kq_BoolEquation::GetEquationAsExpression},
};

py::str Render(const py::object& self, const py::object& syntax, const py::object& hasBlanks)
{
    const Equation& equation = Own(self);
    const bool spaces = RequireFlag(hasBlanks, "spaces");
    const std::string name = Encode(RequireStr(syntax, "syntax"));
    for (const Syntax& known : kSyntaxes) {
        if (name != known.name)
            continue;
        const SharedContent content = equation.Shared();
        const auto render = known.render;
        const auto write = [content, render, spaces] {
            return booleq::ToStd((content->equation.*render)(spaces));
        };
        const bool isShort = equation.GetLength() == Length::Short;
        return Decode(isShort ? write() : Beside(write));
    }
    throw py::value_error("there is no syntax '" + booleq::Excerpt(name) +
                          "'; there are primary, alt1, alt2, alt3, expression");
}

// The text, unless it would be a different equation with the blanks that the library writes; then a
// text with the parentheses that it needs.
std::string ReadableText(const Content& content, const std::string& text,
                         const booleq::Reading& reading)
{
    const std::string typed = booleq::ToStd(content.equation.GetEquation(true));
    Kq_BoolEquation again;
    if (booleq::SetFromText(again, typed, reading) && again == content.equation)
        // A text of three or more characters that begins with 0 would be read as an init value.
        return text.size() > 2 && text[0] == '0' ? "(" + text + ")" : text;
    return WriteOwn(booleq::ToExpression(content.equation), booleq::OwnSyntax::AsTyped,
                    booleq::Parentheses::Clear);
}

// The digits of the rows as a str, the highest row first, without a second copy: 30 inputs have
// 2^30 rows.
py::str Digits(const booleq::Rows& rows, const std::string& prefix, unsigned int rowsPerDigit)
{
    static constexpr char kDigits[] = "0123456789abcdef";
    const size_t numRows = rows.NumRows();
    rowsPerDigit = std::min(rowsPerDigit, static_cast<unsigned int>(numRows));
    const size_t size = prefix.size() + numRows / rowsPerDigit;
    auto text = py::reinterpret_steal<py::str>(PyUnicode_New(static_cast<Py_ssize_t>(size), 127));
    if (!text)
        throw py::error_already_set();
    auto* digit = static_cast<uint8_t*>(PyUnicode_DATA(text.ptr()));
    digit = std::copy(prefix.begin(), prefix.end(), digit);
    const unsigned int mask = (1u << rowsPerDigit) - 1;
    const uint64_t* const words = rows.Words();
    FreelyIf(numRows > 4096, [&] { // no other code has the str yet
        for (size_t row = numRows; row > 0;) {
            const size_t chunk = std::min<size_t>(row, 65536);
            for (const size_t end = row - chunk; row > end;) {
                row -= rowsPerDigit;
                *digit++ = static_cast<uint8_t>(kDigits[words[row / 64] >> (row % 64) & mask]);
            }
            booleq::Watch();
        }
    });
    return text;
}

booleq::Rows RequireRows(const Equation& equation, const py::object& isLsbFirst)
{
    const bool lsbFirst = RequireFlag(isLsbFirst, "lsb_first");
    if (equation.NumInputs() == 0)
        throw py::value_error("an equation without inputs has no init value");
    return RowsOf(equation, lsbFirst);
}

py::str HexInit(const py::object& self, const py::object& lsbFirst)
{
    return Digits(RequireRows(Own(self), lsbFirst), "0x", 4);
}

py::str BinaryInit(const py::object& self, const py::object& lsbFirst)
{
    return Digits(RequireRows(Own(self), lsbFirst), "0b", 1);
}

py::str SizedInit(const py::object& self, const py::object& lsbFirst)
{
    const booleq::Rows rows = RequireRows(Own(self), lsbFirst);
    return Digits(rows, std::to_string(rows.NumRows()) + "'h", 4);
}

py::str Str(const py::object& self)
{
    const Equation& equation = Own(self);
    if (equation.IsInit())
        return HexInit(self, py::bool_(false));
    const SharedContent content = equation.Shared();
    booleq::Reading reading = equation.GetReading();
    const std::string text = Encode(py::reinterpret_borrow<py::str>(equation.Text()));
    const auto write = [content, text, reading] { return ReadableText(*content, text, reading); };
    return Decode(Run(equation.GetLength(), write));
}

// An int as a text with the digits of all rows.
py::str DigitsOf(const py::object& value, size_t numInputs)
{
    if (numInputs == 0)
        throw py::value_error("an equation without inputs has no init value");
    if (numInputs > booleq::kMaxFunctionInputs)
        throw py::value_error(booleq::NoFunctionReason(numInputs));
    const size_t numRows = size_t(1) << numInputs;
    if (value < py::int_(0) || value.attr("bit_length")().cast<size_t>() > numRows)
        throw py::value_error("an init value over " + booleq::Count(numInputs, "input") + " has " +
                              std::to_string(numRows) + " bits: 0 <= value < 2**" +
                              std::to_string(numRows));
    const size_t numBytes = (numRows + 7) / 8;
    const py::bytes little = value.attr("to_bytes")(numBytes, "little");
    const auto* const bytes = reinterpret_cast<const uint8_t*>(PyBytes_AS_STRING(little.ptr()));
    booleq::Rows rows(static_cast<unsigned int>(numInputs));
    FreelyIf(numRows > 4096, [&] {
        for (size_t byte = 0; byte < numBytes; ++byte) {
            rows.Words()[byte / 8] |= static_cast<uint64_t>(bytes[byte]) << (8 * (byte % 8));
            if (byte % 65536 == 0)
                booleq::Watch();
        }
    });
    return numInputs == 1 ? Digits(rows, "0b", 1) : Digits(rows, "0x", 4);
}

py::object FromInit(const py::object& value, const py::object& inputs, const py::object& lsbFirst)
{
    const py::tuple names = RequireInputs(inputs);
    const bool isLsbFirst = RequireFlag(lsbFirst, "lsb_first");
    py::str text;
    if (PyUnicode_Check(value.ptr())) {
        text = RequireStr(value, "value");
    } else {
        if (!PyIndex_Check(value.ptr()))
            throw py::type_error("value must be a str or an int, not " + TypeName(value));
        const auto number = py::reinterpret_steal<py::object>(PyNumber_Index(value.ptr()));
        if (!number)
            throw py::error_already_set();
        text = DigitsOf(number, names.size());
    }
    py::object made = ReadEquation(text, names, isLsbFirst);
    if (!Own(made).IsInit()) {
        booleq::RefusalReport report;
        report.code = "init-digit";
        report.length = 1;
        report.reason = "an init value begins with 0x or 0b, or is a sized literal such as 8'hca";
        RaiseParseError(text, report);
    }
    return made;
}

struct Reader {
    const char* name;
    const booleq::Notation& (*notation)();
};

constexpr Reader kReaders[] = {{"verilog", booleq::VerilogNotation},
                               {"vhdl", booleq::VhdlNotation},
                               {"python", booleq::PythonNotation},
                               {"liberty", booleq::LibertyNotation}};

// Rewrites a text of another notation in ours, over the same names.
py::str FromNotation(const std::string& notation, const py::object& given)
{
    const py::str text = RequireStr(given, "text");
    const std::string bytes = Encode(text);
    for (const Reader& reader : kReaders) {
        if (notation != reader.name)
            continue;
        struct Read {
            std::string own;
            std::string fault;
        };
        const Read read = RunLong(LengthOfText(bytes.size()), [bytes, &reader]() -> Read {
            const booleq::ForeignText foreign = booleq::ReadForeignText(bytes, reader.notation());
            if (!foreign.fault.empty())
                return {std::string(), foreign.fault};
            return {
                WriteOwn(foreign.expression, booleq::OwnSyntax::First, booleq::Parentheses::Clear),
                std::string()};
        });
        if (read.fault.empty())
            return Decode(read.own);
        booleq::RefusalReport report;
        report.code = "notation";
        report.reason = std::string(reader.notation().name) + " does not read it: " + read.fault;
        RaiseParseError(text, report);
    }
    throw py::value_error("there is no reader for " + booleq::Excerpt(notation));
}

// The short form of the equation, as an equation.
Kq_BoolEquation Shortened(const Equation& equation)
{
    const kq_logic::Function function = FunctionOf(equation);
    const kq_logic::ShortForm found =
        FreelyIf(true, [&] { return kq_logic::FindShortForm(function); });
    if (!found.fault.empty())
        throw py::value_error(found.fault);
    Kq_BoolEquation shortened;
    booleq::Reading reading;
    reading.hasInputs = true;
    reading.inputs = equation.InputBytes();
    booleq::SetFromText(shortened, found.text, reading);
    return shortened;
}

py::object ConvertEquation(const py::object& self, const py::object& to, const py::object& unit,
                           const py::object& hasShort, double seconds)
{
    const Equation& equation = Own(self);
    const bool isShort = RequireFlag(hasShort, "short");
    const SharedContent content = equation.Shared();
    const std::string target = Encode(RequireStr(to, "to"));
    const std::string name = Encode(RequireStr(unit, "name"));
    const Kq_BoolEquation converted = isShort ? Shortened(equation) : content->equation;
    const auto conversion = RunLong(equation.GetLength(), [converted, target, name, seconds] {
        kq_logic::Limits limits;
        limits.seconds = seconds;
        return kq_logic::Convert(converted, target, name, limits);
    });
    if (!conversion.fault.empty())
        throw py::value_error(conversion.fault);
    py::list names;
    for (size_t input = 0; input < conversion.names.size(); ++input)
        names.append(
            py::make_tuple(Decode(conversion.inputs[input]), Decode(conversion.names[input])));
    return py::make_tuple(Decode(conversion.text), Decode(conversion.unit),
                          Decode(conversion.output), names, conversion.isProved,
                          Decode(conversion.doubt));
}

py::tuple Targets()
{
    return DecodeAll(kq_logic::ConversionTargets());
}

} // namespace

void BindTexts(py::module_& module)
{
    module.def("set_equation_class", &SetEquationClass);
    module.def("render", &Render);
    module.def("readable", &Str);
    module.def("hex_init", &HexInit);
    module.def("binary_init", &BinaryInit);
    module.def("sized_init", &SizedInit);
    module.def("from_init", &FromInit);
    module.def("from_notation", &FromNotation);
    module.def("convert", &ConvertEquation);
    module.def("conversion_targets", &Targets);
}

} // namespace booleq_python
