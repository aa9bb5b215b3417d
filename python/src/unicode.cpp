#include "unicode.h"

#include "text.h"

namespace booleq_python {

namespace {

// The number of bytes that Encode makes of a character.
size_t NumBytes(Py_UCS4 character)
{
    const bool standsForByte = character >= 0xdc80 && character <= 0xdcff;
    if (character < 0x80 || standsForByte)
        return 1;
    if (character < 0x800)
        return 2;
    return character < 0x10000 ? 3 : 4;
}

std::string EncodeWith(const py::str& text, const char* errors)
{
    const auto bytes =
        py::reinterpret_steal<py::bytes>(PyUnicode_AsEncodedString(text.ptr(), "utf-8", errors));
    if (!bytes)
        throw py::error_already_set();
    return std::string(bytes);
}

} // namespace

std::string Encode(const py::str& text)
{
    return EncodeWith(text, "surrogateescape");
}

std::string Shown(const py::handle& value)
{
    if (!PyUnicode_Check(value.ptr()))
        return ShownValue(value);
    return booleq::Excerpt(EncodeWith(py::reinterpret_borrow<py::str>(value), "backslashreplace"));
}

std::string ShownValue(const py::handle& value)
{
    return booleq::Excerpt(EncodeWith(py::repr(value), "backslashreplace"));
}

std::string TypeName(const py::handle& value)
{
    return Py_TYPE(value.ptr())->tp_name;
}

py::str Decode(const std::string& bytes)
{
    PyObject* text = PyUnicode_DecodeUTF8(bytes.data(), static_cast<Py_ssize_t>(bytes.size()),
                                          "surrogateescape");
    if (!text)
        throw py::error_already_set();
    return py::reinterpret_steal<py::str>(text);
}

py::object SameInBytes(const py::str& text)
{
    try {
        return Decode(Encode(text));
    } catch (const py::error_already_set& error) {
        if (!error.matches(PyExc_UnicodeEncodeError))
            throw;
        return {};
    }
}

py::tuple DecodeAll(const std::vector<std::string>& names)
{
    py::tuple decoded(names.size());
    for (size_t index = 0; index < names.size(); ++index)
        decoded[index] = Decode(names[index]);
    return decoded;
}

py::str RequireStr(const py::handle& value, const char* what)
{
    if (!PyUnicode_Check(value.ptr()))
        throw py::type_error(std::string(what) + " must be a str, not " + TypeName(value));
    PyObject* plain = PyUnicode_FromObject(value.ptr());
    if (!plain)
        throw py::error_already_set();
    return py::reinterpret_steal<py::str>(plain);
}

bool RequireFlag(const py::handle& value, const char* what)
{
    if (!PyBool_Check(value.ptr()) &&
        !py::isinstance(value, py::module_::import("numpy").attr("bool_")))
        throw py::type_error(std::string(what) + " must be False or True, not " + TypeName(value));
    return PyObject_IsTrue(value.ptr()) == 1;
}

py::tuple RequireNames(const py::object& names)
{
    if (PyUnicode_Check(names.ptr()))
        throw py::type_error("inputs must be an iterable of names; a str would be taken letter by "
                             "letter: write inputs=['A', 'B']");
    if (!py::isinstance<py::iterable>(names))
        throw py::type_error("inputs must be an iterable of names, not " + TypeName(names));
    py::list checked;
    for (const py::handle name : names)
        checked.append(RequireStr(name, "a name in inputs"));
    return py::tuple(checked);
}

std::vector<std::string> EncodeAll(const py::tuple& names)
{
    std::vector<std::string> encoded;
    encoded.reserve(names.size());
    for (const py::handle name : names)
        encoded.push_back(Encode(py::reinterpret_borrow<py::str>(name)));
    return encoded;
}

Span InCharacters(const py::str& text, const Span& inBytes)
{
    const int kind = PyUnicode_KIND(text.ptr());
    const void* const data = PyUnicode_DATA(text.ptr());
    const Py_ssize_t size = PyUnicode_GET_LENGTH(text.ptr());
    const size_t endInBytes = inBytes.offset + inBytes.length;
    Span span = {0, 0};
    size_t position = 0; // of the current character, in bytes
    for (Py_ssize_t index = 0; index < size; ++index) {
        const size_t next = position + NumBytes(PyUnicode_READ(kind, data, index));
        if (next <= inBytes.offset)
            ++span.offset;
        else if (position < endInBytes)
            ++span.length;
        else
            break;
        position = next;
    }
    return span;
}

} // namespace booleq_python
