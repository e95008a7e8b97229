// _fastaccess/: tests of single bytes, bit values, the clock, and a search that skips strings and brackets.
//   in     bytes, numbers, byte strings and stretches of Python source
//   out    answers and offsets
//   keeps  nothing but the state of a search, in its own structure
//   start  here; numbers.h, clock.h, non_nested.h
// A failure is a reserved value with a host exception pending.
#pragma once

#include <cstring>

#include <nanobind/nanobind.h>

#include "text/char_class.h"  // IsDigit too

namespace nb = nanobind;

namespace codeloom {

// A letter or digit of ASCII.
constexpr bool IsAlnum(char c) {
    return IsNameByte(c) && c != '_';
}

// True when `sub` occurs in `whole`, where a zero byte ends either of them. On failure -1: TypeError unless
// both are exactly byte strings.
inline int StrInStr(nb::handle sub, nb::handle whole) {
    if (!PyBytes_CheckExact(sub.ptr()) || !PyBytes_CheckExact(whole.ptr())) {
        PyErr_SetString(PyExc_TypeError, "Both sub and whole must be strings");
        return -1;
    }
    return std::strstr(PyBytes_AS_STRING(whole.ptr()), PyBytes_AS_STRING(sub.ptr())) != nullptr;
}

// Locations are shared, so that equal ones are the same object.
inline bool LocationsEqual(nb::handle loc1, nb::handle loc2) {
    return loc1.is(loc2);
}

}  // namespace codeloom
