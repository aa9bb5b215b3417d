#include "errors.h"

#include <string>

#include "lock.h"
#include "unicode.h"

namespace booleq_python {

namespace {

// A text with a byte for each character of 'text' and the same line ends.
std::string ByteForCharacter(const py::str& text)
{
    const int kind = PyUnicode_KIND(text.ptr());
    const void* const data = PyUnicode_DATA(text.ptr());
    std::string projected(py::len(text), 'x');
    for (size_t index = 0; index < projected.size(); ++index)
        if (PyUnicode_READ(kind, data, static_cast<Py_ssize_t>(index)) == '\n')
            projected[index] = '\n';
    return projected;
}

} // namespace

void RaiseParseError(const py::str& text, const booleq::RefusalReport& report)
{
    const Span place = InCharacters(text, {report.offset, report.length});
    std::string message = "refused";
    if (report.length != 0)
        message += " at " + booleq::PlaceName(ByteForCharacter(text), place.offset);
    message += ": " + report.reason;
    if (!report.hint.empty())
        message += "; " + report.hint;
    const py::object type = ResultClass("ParseError");
    const py::object error = type(Decode(message), text, place.offset, place.length, report.code,
                                  Decode(report.reason), Decode(report.hint));
    PyErr_SetObject(type.ptr(), error.ptr());
    throw py::error_already_set();
}

void RaiseParseError(const py::str& text, const std::string& bytes, const booleq::Reading& reading)
{
    constexpr size_t kLongText = 50000;
    const auto explain = [bytes, reading] { return booleq::ExplainRefusal(bytes, reading); };
    RaiseParseError(text, bytes.size() > kLongText ? Beside(explain) : explain());
}

py::object ResultClass(const char* name)
{
    return py::module_::import("booleq._results").attr(name);
}

} // namespace booleq_python
