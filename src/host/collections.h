// Lists and tuples of the host, read in place. A list that host code can reach may change whenever host code
// runs, so every index is checked.
#pragma once

#include <cstdint>

#include <nanobind/nanobind.h>

namespace nb = nanobind;

namespace codeloom {

[[noreturn]] void RaiseIndexError(const char* message);

// `candidate` as a list or none; anything else is the host's TypeError.
nb::object ListOrNone(nb::handle candidate);

inline Py_ssize_t ListSize(nb::handle list) {
    return PyList_GET_SIZE(list.ptr());
}

// Borrowed. A negative index counts from the end, as the host's does; IndexError outside the list.
inline nb::handle ListItem(nb::handle list, Py_ssize_t i) {
    const Py_ssize_t size = PyList_GET_SIZE(list.ptr());
    if (i < 0) i += size;
    if (i < 0 || i >= size) [[unlikely]]
        RaiseIndexError("list index out of range");
    return PyList_GET_ITEM(list.ptr(), i);
}

// The items in [start, end) as a new list; the range is cut to the list.
inline nb::list ListSlice(nb::handle list, Py_ssize_t start, Py_ssize_t end) {
    nb::list slice = nb::steal<nb::list>(PyList_GetSlice(list.ptr(), start, end));
    if (!slice.is_valid()) throw nb::python_error();
    return slice;
}

// Removes the item at `i`; IndexError outside the list.
void DeleteListItem(nb::handle list, Py_ssize_t i);

inline Py_ssize_t TupleSize(nb::handle tuple) {
    return PyTuple_GET_SIZE(tuple.ptr());
}

inline nb::handle TupleItem(nb::handle tuple, Py_ssize_t i) {
    const Py_ssize_t size = PyTuple_GET_SIZE(tuple.ptr());
    if (i < 0) i += size;
    if (i < 0 || i >= size) [[unlikely]]
        RaiseIndexError("tuple index out of range");
    return PyTuple_GET_ITEM(tuple.ptr(), i);
}

// A new tuple of `size` items, item i made by make(i), which returns an nb::object.
template <class Make>
nb::tuple MakeTuple(Py_ssize_t size, Make make) {
    nb::tuple result = nb::steal<nb::tuple>(PyTuple_New(size));
    if (!result.is_valid()) throw nb::python_error();
    for (Py_ssize_t i = 0; i < size; ++i) PyTuple_SET_ITEM(result.ptr(), i, make(i).release().ptr());
    return result;
}

// True when `key` is a key of `dict`.
inline bool DictContains(nb::handle dict, nb::handle key) {
    const int found = PyDict_Contains(dict.ptr(), key.ptr());
    if (found < 0) throw nb::python_error();
    return found != 0;
}

// The value of `key`; an invalid object when there is none, or no dictionary at all.
nb::object FindInDict(nb::handle dict_or_none, nb::handle key);

// Another number after each change of a dictionary, and another for each dictionary; 0 for none. 3.12
// and 3.13 keep these numbers, which they call deprecated.
inline uint64_t DictVersion(nb::handle dict_or_none) {
    static_assert(PY_VERSION_HEX < 0x030E0000,
                  "3.14 has no version of a dictionary: watch it by PyDict_Watch");
    if (dict_or_none.is_none()) return 0;
#pragma GCC diagnostic push
#pragma GCC diagnostic ignored "-Wdeprecated-declarations"
    return reinterpret_cast<PyDictObject*>(dict_or_none.ptr())->ma_version_tag;
#pragma GCC diagnostic pop
}

// True when `candidate` is a class derived from `base`, or `base` itself.
bool IsSubclass(nb::handle candidate, nb::handle base);

// The truth value, as the host's bool() gives it.
inline bool IsTrue(nb::handle value) {
    const int is_true = PyObject_IsTrue(value.ptr());
    if (is_true < 0) throw nb::python_error();
    return is_true != 0;
}

inline bool IsText(nb::handle candidate) {
    return PyUnicode_Check(candidate.ptr());
}

}  // namespace codeloom
