// Arguments of functions that a host calls: a TypeError names the one that is of a wrong type.
#pragma once

#include <algorithm>
#include <climits>
#include <cstdint>
#include <string>

#include "host/errors.h"

namespace codeloom {

// "row must be an int, not str"
[[noreturn]] inline void RaiseWrongType(nb::handle value, const char* name, const char* type) {
    const std::string said =
        std::string(name) + " must be " + type + ", not " + Py_TYPE(value.ptr())->tp_name;
    RaiseHost(PyExc_TypeError, said.c_str());
}

inline nb::str StrArgument(nb::handle value, const char* name) {
    if (!PyUnicode_Check(value.ptr())) RaiseWrongType(value, name, "a str");
    return nb::borrow<nb::str>(value);
}

inline bool BoolArgument(nb::handle value, const char* name) {
    if (!PyBool_Check(value.ptr())) RaiseWrongType(value, name, "a bool");
    return value.ptr() == Py_True;
}

// An integer that an int can't hold is the nearest that it can.
inline int IntArgument(nb::handle value, const char* name) {
    if (!PyLong_Check(value.ptr())) RaiseWrongType(value, name, "an int");
    int overflow = 0;
    const long long number = PyLong_AsLongLongAndOverflow(value.ptr(), &overflow);
    if (overflow != 0) return overflow < 0 ? INT_MIN : INT_MAX;
    return static_cast<int>(std::clamp<long long>(number, INT_MIN, INT_MAX));
}

// A number from zero; ValueError for less.
inline uint32_t CountArgument(nb::handle value, const char* name) {
    const int number = IntArgument(value, name);
    if (number < 0) RaiseHost(PyExc_ValueError, (std::string(name) + " must be at least 0").c_str());
    return static_cast<uint32_t>(number);
}

// An instance of a bound class; `type` is its name for the host, with its article.
template <class T>
const T& InstanceArgument(nb::handle value, const char* name, const char* type) {
    if (!nb::isinstance<T>(value)) RaiseWrongType(value, name, type);
    return *nb::inst_ptr<T>(value);
}

}  // namespace codeloom
