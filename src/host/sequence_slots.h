// The interpreter's sequence protocol for a class that gives its items one by one.
//
// Bound by hand: through a bound operation each step of a loop would cost a call, and its end a C++
// exception. A class Items needs
//     size_t Size() const;
//     nb::object Item(size_t i) const;                                  // i < Size()
//     nb::object Slice(size_t first, ptrdiff_t step, size_t count) const;
#pragma once

#include <nanobind/nanobind.h>

#include "host/errors.h"
#include "host/refuse_new.h"

namespace nb = nanobind;

namespace codeloom {

namespace slots {

// What `make` gives; null with the exception pending when it fails.
template <class Make>
PyObject* Guarded(Make make) noexcept {
    try {
        return make().release().ptr();
    } catch (nb::python_error& error) {
        error.restore();
    } catch (const std::bad_alloc&) {
        PyErr_NoMemory();
    } catch (const std::exception& error) {
        PyErr_SetString(PyExc_RuntimeError, error.what());
    }
    return nullptr;
}

template <class Items>
Py_ssize_t Length(PyObject* self) noexcept {
    return static_cast<Py_ssize_t>(nb::inst_ptr<Items>(self)->Size());
}

// `i` counts from the beginning here: the interpreter has added the length to a negative index.
template <class Items>
PyObject* Item(PyObject* self, Py_ssize_t i) noexcept {
    const Items& items = *nb::inst_ptr<Items>(self);
    if (i < 0 || static_cast<size_t>(i) >= items.Size()) {
        PyErr_SetString(PyExc_IndexError, "index out of range");
        return nullptr;
    }
    return Guarded([&] { return items.Item(static_cast<size_t>(i)); });
}

template <class Items>
PyObject* Subscript(PyObject* self, PyObject* key) noexcept {
    if (PyIndex_Check(key)) {
        Py_ssize_t i = PyNumber_AsSsize_t(key, PyExc_IndexError);
        if (i == -1 && PyErr_Occurred()) return nullptr;
        return Item<Items>(self, i < 0 ? i + Length<Items>(self) : i);
    }
    Py_ssize_t start = 0, stop = 0, step = 0;
    if (!PySlice_Check(key)) {
        PyErr_Format(PyExc_TypeError, "indices must be integers or slices, not %.200s",
                     Py_TYPE(key)->tp_name);
        return nullptr;
    }
    if (PySlice_Unpack(key, &start, &stop, &step) < 0) return nullptr;
    const Py_ssize_t count = PySlice_AdjustIndices(Length<Items>(self), &start, &stop, step);
    return Guarded([&] {
        const Items& items = *nb::inst_ptr<Items>(self);
        return items.Slice(static_cast<size_t>(start), step, static_cast<size_t>(count));
    });
}

}  // namespace slots

// The index of the first item from `start` up to `stop`, or to the end, that equals `value`; ValueError when
// there is none.
inline Py_ssize_t SequenceIndex(nb::handle sequence, nb::handle value, nb::handle start, nb::handle stop) {
    const nb::object part = sequence[nb::slice(start, stop, nb::none())];
    const Py_ssize_t i = PySequence_Index(part.ptr(), value.ptr());
    if (i < 0) throw nb::python_error();
    const auto bounds =
        nb::cast<nb::tuple>(nb::slice(start, stop, nb::none()).attr("indices")(nb::len(sequence)));
    return i + nb::cast<Py_ssize_t>(bounds[0]);
}

// How many items equal `value`.
inline Py_ssize_t SequenceCount(nb::handle sequence, nb::handle value) {
    const Py_ssize_t count = PySequence_Count(sequence.ptr(), value.ptr());
    if (count < 0) throw nb::python_error();
    return count;
}

// For nb::type_slots.
template <class Items>
inline PyType_Slot kSequenceSlots[] = {
    {Py_sq_length, reinterpret_cast<void*>(slots::Length<Items>)},
    {Py_mp_length, reinterpret_cast<void*>(slots::Length<Items>)},
    {Py_sq_item, reinterpret_cast<void*>(slots::Item<Items>)},
    {Py_mp_subscript, reinterpret_cast<void*>(slots::Subscript<Items>)},
    {Py_tp_iter, reinterpret_cast<void*>(PySeqIter_New)},
    {Py_tp_new, reinterpret_cast<void*>(RefuseNew)},
    {0, nullptr},
};

}  // namespace codeloom
