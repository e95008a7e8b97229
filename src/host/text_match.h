// Comparison of a text string of the host with a constant: by length and bytes, with no new object.
#pragma once

#include <cstring>
#include <string_view>

#include <nanobind/nanobind.h>

namespace nb = nanobind;

namespace codeloom {

// True when `candidate` is a text string that equals `constant`, which is ASCII.
inline bool TextIs(nb::handle candidate, std::string_view constant) {
    PyObject* const text = candidate.ptr();
    if (!PyUnicode_Check(text) || PyUnicode_READY(text) != 0 || !PyUnicode_IS_ASCII(text)) return false;
    return static_cast<size_t>(PyUnicode_GET_LENGTH(text)) == constant.size() &&
           std::memcmp(PyUnicode_DATA(text), constant.data(), constant.size()) == 0;
}

// True when `candidate` equals one of the constants.
template <size_t... sizes>
bool TextIsOneOf(nb::handle candidate, const char (&... constants)[sizes]) {
    return (TextIs(candidate, std::string_view(constants, sizes - 1)) || ...);
}

}  // namespace codeloom
