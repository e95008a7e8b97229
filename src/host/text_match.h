// Comparison of a text string of the host with a constant: by length and bytes, with no new object.
#pragma once

#include <cstring>
#include <string_view>

#include <nanobind/nanobind.h>

namespace nb = nanobind;

namespace codeloom {

// The characters of an ASCII text string; false for anything else.
inline bool GetAscii(nb::handle candidate, std::string_view& characters) {
    PyObject* const text = candidate.ptr();
    if (!PyUnicode_Check(text) || PyUnicode_READY(text) != 0 || !PyUnicode_IS_ASCII(text)) return false;
    characters = {static_cast<const char*>(PyUnicode_DATA(text)),
                  static_cast<size_t>(PyUnicode_GET_LENGTH(text))};
    return true;
}

// True when `candidate` is a text string that equals `constant`, which is ASCII.
inline bool TextIs(nb::handle candidate, std::string_view constant) {
    std::string_view characters;
    return GetAscii(candidate, characters) && characters == constant;
}

// True when `candidate` equals one of the constants. Their sizes are known here, so that each costs a
// comparison or two.
template <size_t... sizes>
bool TextIsOneOf(nb::handle candidate, const char (&... constants)[sizes]) {
    std::string_view characters;
    if (!GetAscii(candidate, characters)) return false;
    return ((characters.size() == sizes - 1 && std::memcmp(characters.data(), constants, sizes - 1) == 0) ||
            ...);
}

}  // namespace codeloom
