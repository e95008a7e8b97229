// Questions about kinds, records and scopes. A failure is -1 with a host exception pending.
#pragma once

#include <nanobind/nanobind.h>

#include "symbolinfo/vocabulary.h"

namespace nb = nanobind;

namespace codeloom {

// True for what a `def` makes.
inline bool IsDefKind(char kind) {
    return kind == kFunctionKind || kind == kMethodKind || kind == kUnboundMethodKind;
}

// The kind of a zero-terminated record.
inline char GetInfoBytesKind(const char* ibytes_ptr) {
    return ibytes_ptr[0] == ':' && ibytes_ptr[1] != '\0' ? ibytes_ptr[1] : kPlainEquivKind;
}

// True for the empty scope; `scope` is any sized object.
inline int IsTopLevelModuleScope(nb::handle scope) {
    const Py_ssize_t length = PyObject_Size(scope.ptr());
    return length < 0 ? -1 : length == 0;
}

// The number of characters of a text string; -1 on failure, for anything else with a TypeError.
inline Py_ssize_t TextLength(nb::handle text) {
    if (PyUnicode_Check(text.ptr())) return PyUnicode_GET_LENGTH(text.ptr());
    PyErr_Format(PyExc_TypeError, "expected str, %s found", Py_TYPE(text.ptr())->tp_name);
    return -1;
}

// True for the scope of a def line itself.
inline int IsDefLineScope(nb::handle scope) {
    const Py_ssize_t length = TextLength(scope);
    if (length < 0) return -1;
    const auto suffix_length = static_cast<Py_ssize_t>(_kDotLineScopeName.size());
    if (length < suffix_length) return false;
    for (Py_ssize_t i = 0; i < suffix_length; ++i) {
        const auto wanted = static_cast<unsigned char>(_kDotLineScopeName[static_cast<size_t>(i)]);
        if (PyUnicode_READ_CHAR(scope.ptr(), length - suffix_length + i) != wanted) return false;
    }
    return true;
}

// True when a scope that is related to a def line's scope is the one around it: by its length alone.
inline int IsParentOfDefLineScope(nb::handle maybe_parent, nb::handle def_line_scope) {
    const Py_ssize_t parent_length = TextLength(maybe_parent);
    const Py_ssize_t length = parent_length < 0 ? -1 : TextLength(def_line_scope);
    if (length < 0) return -1;
    return parent_length + static_cast<Py_ssize_t>(_kDotLineScopeName.size()) == length;
}

}  // namespace codeloom
