// For classes whose objects only the engine makes: one without its native part would be read as if it had it.
#pragma once

#include <nanobind/nanobind.h>

namespace codeloom {

inline PyObject* RefuseNew(PyTypeObject* type, PyObject*, PyObject*) noexcept {
    PyErr_Format(PyExc_TypeError, "cannot create '%.200s' instances", type->tp_name);
    return nullptr;
}

// For nb::type_slots.
inline PyType_Slot kNotMadeByHost[] = {
    {Py_tp_new, reinterpret_cast<void*>(RefuseNew)},
    {0, nullptr},
};

}  // namespace codeloom
