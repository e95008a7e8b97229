// How the host gives pointers and single bytes.
//   in     a byte or text string for a pointer; an integer, a byte string or a text string of one for a byte
//   out    views and bytes, checked against the buffer that is really there
#pragma once

#include <nanobind/nanobind.h>

#include "host/text.h"

namespace codeloom {

using namespace nb::literals;

// A pointer argument, given as a byte or text string.
struct CUtf8Argument {
    CUtf8 text;

    const char* Pointer() const { return text->data(); }

    // ValueError, which names the argument, unless `size` bytes are there.
    void Require(const char* name, Py_ssize_t size) const {
        const auto available = static_cast<Py_ssize_t>(text->size());
        if (size >= 0 && size <= available) return;
        PyErr_Format(PyExc_ValueError, "%s %zd lies outside the buffer of %zd bytes", name, size, available);
        throw nb::python_error();
    }

    // False for a position at or after `end_pos`, whatever that is; otherwise ValueError when `end_pos` lies
    // outside the buffer.
    bool HasByteAt(Py_ssize_t pos, Py_ssize_t end_pos) const {
        if (pos >= end_pos) return false;
        Require("end_pos", end_pos);
        return pos >= 0;
    }
};

// A single byte: an integer from 0 to 255, or a byte or text string of one byte.
struct CByteArgument {
    char byte = 0;
};

// A native result with a reserved value for failure, as a C++ exception.
template <class T>
T CheckedResult(T result, T failure) {
    if (result == failure && PyErr_Occurred() != nullptr) throw nb::python_error();
    return result;
}

}  // namespace codeloom

namespace nanobind::detail {

template <>
struct type_caster<codeloom::CUtf8Argument> {
    NB_TYPE_CASTER(codeloom::CUtf8Argument, const_name("bytes | str"))

    bool from_python(handle source, uint32_t, cleanup_list*) noexcept {
        if (!PyBytes_Check(source.ptr()) && !PyUnicode_Check(source.ptr())) return false;
        try {
            value.text = codeloom::CUtf8(source);
            return true;
        } catch (const std::exception&) {
            PyErr_Clear();
            return false;
        }
    }
};

template <>
struct type_caster<codeloom::CByteArgument> {
    NB_TYPE_CASTER(codeloom::CByteArgument, const_name("int | bytes | str"))

    bool from_python(handle source, uint32_t, cleanup_list*) noexcept {
        if (PyLong_Check(source.ptr())) return _FromInteger(source);
        if (PyBytes_Check(source.ptr()) && PyBytes_GET_SIZE(source.ptr()) == 1) {
            value.byte = PyBytes_AS_STRING(source.ptr())[0];
            return true;
        }
        if (!PyUnicode_Check(source.ptr()) || PyUnicode_GET_LENGTH(source.ptr()) != 1) return false;
        const Py_UCS4 ch = PyUnicode_READ_CHAR(source.ptr(), 0);
        value.byte = static_cast<char>(ch);
        return ch < 0x80;
    }

  private:
    bool _FromInteger(handle source) {
        int overflow = 0;
        const long number = PyLong_AsLongAndOverflow(source.ptr(), &overflow);
        value.byte = static_cast<char>(number);
        return overflow == 0 && number >= 0 && number < 256;
    }
};

}  // namespace nanobind::detail
