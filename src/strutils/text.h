// The primitives on strings of the host. A failure is a reserved value with a host exception pending.
#pragma once

#include <nanobind/nanobind.h>

#include "neighbours/strutils/text.h"
#include "strutils/utf8.h"

namespace codeloom {

// The byte of a byte string or the code point of a text string at index `i`, from the end if negative. On
// failure -1: IndexError outside the string, TypeError for anything else.
inline long OrdAt(nb::handle s, Py_ssize_t i) {
    const bool is_bytes = PyBytes_Check(s.ptr());
    if (!is_bytes && !PyUnicode_Check(s.ptr())) {
        PyErr_Format(PyExc_TypeError,
                     s.is_none() ? "'%s' object is not subscriptable" : "expected str or bytes, %s found",
                     Py_TYPE(s.ptr())->tp_name);
        return -1;
    }
    const Py_ssize_t length = is_bytes ? PyBytes_GET_SIZE(s.ptr()) : PyUnicode_GET_LENGTH(s.ptr());
    if (i < 0) i += length;
    if (i < 0 || i >= length) {
        PyErr_SetString(PyExc_IndexError, is_bytes ? "index out of range" : "string index out of range");
        return -1;
    }
    if (is_bytes) return static_cast<unsigned char>(PyBytes_AS_STRING(s.ptr())[i]);
    return static_cast<long>(PyUnicode_READ_CHAR(s.ptr(), i));
}

inline nb::object Utf8Concat2(nb::handle s0, nb::handle s1) {
    return Utf8Concat5(s0, s1, nb::none(), nb::none(), nb::none());
}

inline nb::object Utf8Concat3(nb::handle s0, nb::handle s1, nb::handle s2) {
    return Utf8Concat5(s0, s1, s2, nb::none(), nb::none());
}

inline nb::object Utf8Concat4(nb::handle s0, nb::handle s1, nb::handle s2, nb::handle s3) {
    return Utf8Concat5(s0, s1, s2, s3, nb::none());
}

// The UTF-8 bytes of a byte string or text string, in the string itself. Null on failure: TypeError for
// anything else, UnicodeEncodeError for a text with lone surrogates, which has no such form.
inline const char* GetUtf8Ptr(nb::handle u) {
    if (PyBytes_Check(u.ptr())) return PyBytes_AS_STRING(u.ptr());
    if (PyUnicode_Check(u.ptr())) return PyUnicode_AsUTF8(u.ptr());
    PyErr_Format(PyExc_TypeError, "expected str or bytes, %s found", Py_TYPE(u.ptr())->tp_name);
    return nullptr;
}

// PtrFindByte in a byte string. On failure -2, for what isn't a byte string with a TypeError.
inline Py_ssize_t BytesFindByte(nb::handle b, char c, Py_ssize_t start = 0) {
    if (PyBytes_Check(b.ptr()))
        return PtrFindByte(PyBytes_AS_STRING(b.ptr()), PyBytes_GET_SIZE(b.ptr()), c, start);
    PyErr_Format(PyExc_TypeError, b.is_none() ? "expected bytes, %s found" : "b must be bytes, %s found",
                 Py_TYPE(b.ptr())->tp_name);
    return -2;
}

}  // namespace codeloom
