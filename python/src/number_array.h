// Numbers as a NumPy array. NumPy is used only through its Python interface and buffers.
#ifndef BOOLEQ_PYTHON_NUMBER_ARRAY_H
#define BOOLEQ_PYTHON_NUMBER_ARRAY_H

#include <cstdint>
#include <cstring>
#include <vector>

#include <pybind11/pybind11.h>

namespace booleq_python {

// A copy, as an array of uint64 or uint32.
template <class Number>
pybind11::object ArrayOf(const std::vector<Number>& numbers)
{
    static_assert(sizeof(Number) == 8 || sizeof(Number) == 4, "an unsigned type of NumPy's");
    const pybind11::module_ numpy = pybind11::module_::import("numpy");
    pybind11::object array =
        numpy.attr("empty")(numbers.size(), sizeof(Number) == 8 ? "uint64" : "uint32");
    const pybind11::buffer_info info = pybind11::buffer(array).request(true);
    if (!numbers.empty())
        std::memcpy(info.ptr, numbers.data(), numbers.size() * sizeof(Number));
    return array;
}

} // namespace booleq_python

#endif
