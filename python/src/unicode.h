// Converts between str and the bytes that the library reads: UTF-8, with a lone surrogate for every
// byte that is not valid, so that each byte string has a str and converts back to itself.
#ifndef BOOLEQ_PYTHON_UNICODE_H
#define BOOLEQ_PYTHON_UNICODE_H

#include <cstddef>
#include <string>
#include <vector>

#include <pybind11/pybind11.h>

namespace booleq_python {

namespace py = pybind11;

// Fails: UnicodeEncodeError for a surrogate that does not stand for a byte.
std::string Encode(const py::str& text);
py::str Decode(const std::string& bytes);
// What Decode makes of the text's bytes; null for a surrogate that does not stand for a byte.
py::object SameInBytes(const py::str& text);
// Any object as a message shows it, shortened: a str as it is, others as their repr.
std::string Shown(const py::handle& value);
// The same with quotes around a str, as in Python's own messages.
std::string ShownValue(const py::handle& value);
std::string TypeName(const py::handle& value);
py::tuple DecodeAll(const std::vector<std::string>& names);

// 'value' as a plain str.  Fails: TypeError that begins with 'what'.
py::str RequireStr(const py::handle& value, const char* what);
// Fails: TypeError that begins with 'what'.
bool RequireFlag(const py::handle& value, const char* what);
// The names of an iterable.  Fails: TypeError for a str, which would be taken letter by letter, for
// an object that is not iterable, and for an element that is not a str.
py::tuple RequireNames(const py::object& names);
std::vector<std::string> EncodeAll(const py::tuple& names);

// Converts a place in bytes to one in characters: all characters that have a byte there.
struct Span {
    size_t offset;
    size_t length;
};
Span InCharacters(const py::str& text, const Span& inBytes);

} // namespace booleq_python

#endif
