// Between str and the bytes that the library reads: UTF-8, every byte that is none as a lone
// surrogate, so that each byte string has a str and back.
#ifndef BOOLEQ_PYTHON_UNICODE_H
#define BOOLEQ_PYTHON_UNICODE_H

#include <cstddef>
#include <string>
#include <vector>

#include <pybind11/pybind11.h>

namespace booleq_python {

namespace py = pybind11;

// Fails: UnicodeEncodeError for a surrogate that stands for no byte.
std::string Encode(const py::str& text);
py::str Decode(const std::string& bytes);
// What Decode makes of its bytes; null for a surrogate that stands for no byte.
py::object SameInBytes(const py::str& text);
// Any object for a message, not too long, a name as it is, others as repr.
std::string Shown(const py::handle& value);
// The same with quotes around a str, as Python's own messages show values.
std::string ShownValue(const py::handle& value);
std::string TypeName(const py::handle& value);
py::tuple DecodeAll(const std::vector<std::string>& names);

// 'value' as a plain str.  Fails: TypeError that begins with 'what'.
py::str RequireStr(const py::handle& value, const char* what);
// Fails: TypeError that begins with 'what'.
bool RequireFlag(const py::handle& value, const char* what);
// The names of an iterable.  Fails: TypeError for a str, which would be taken letter by letter, for
// what is not an iterable, and for an element that is not a str.
py::tuple RequireNames(const py::object& names);
std::vector<std::string> EncodeAll(const py::tuple& names);

// A place in bytes as one in characters: all that have a byte there.
struct Span {
    size_t offset;
    size_t length;
};
Span InCharacters(const py::str& text, const Span& inBytes);

} // namespace booleq_python

#endif
