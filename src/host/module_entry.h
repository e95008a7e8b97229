// The entry of a native module whose load fails with the exception that was raised.
#pragma once

#include <nanobind/nanobind.h>

#ifdef Py_GIL_DISABLED
#error "codeloom relies on the interpreter's lock: build it for a Python that isn't free-threaded"
#endif

namespace codeloom {

// False, with an ImportError, in a subinterpreter: what is kept for the life of the process, host objects
// among it, belongs to the interpreter that loaded the module first.
inline bool MayBeLoaded(const char* name) {
    if (PyInterpreterState_Get() == PyInterpreterState_Main()) return true;
    PyErr_Format(PyExc_ImportError,
                 "codeloom.%s can't be loaded in a subinterpreter: use it in the main interpreter, or in a "
                 "process of its own",
                 name);
    return false;
}

// `definition`, which a subinterpreter of its own lock may execute too, so that it is `MayBeLoaded` that
// refuses it: from 3.13 on the host refuses before any code of ours runs, and doesn't say what to do.
inline PyObject* DefinitionThatRefuses(PyObject* definition) {
#ifdef Py_mod_multiple_interpreters
    if (definition == nullptr) return nullptr;
    for (auto* slot = reinterpret_cast<PyModuleDef*>(definition)->m_slots; slot->slot != 0; ++slot)
        if (slot->slot == Py_mod_multiple_interpreters) slot->value = Py_MOD_PER_INTERPRETER_GIL_SUPPORTED;
#endif
    return definition;
}

}  // namespace codeloom

// CODELOOM_MODULE(name, variable) { body }: as NB_MODULE, which would wrap the exception into an ImportError
// that says nothing.
#define CODELOOM_MODULE(name, variable)                                                          \
    static void _Load_##name(nanobind::module_ variable);                                        \
    static int _Execute_##name(PyObject* made) {                                                 \
        if (!codeloom::MayBeLoaded(#name)) return -1;                                            \
        nanobind::detail::internals = NB_CALL(nb_module_init)(NB_DOMAIN_STR, made);              \
        if (nanobind::detail::internals == nullptr) return -1;                                   \
        try {                                                                                    \
            _Load_##name(nanobind::borrow<nanobind::module_>(made));                             \
            return 0;                                                                            \
        } catch (nanobind::python_error & error) {                                               \
            error.restore();                                                                     \
        } catch (const std::exception& error) {                                                  \
            PyErr_SetString(PyExc_ImportError, error.what());                                    \
        }                                                                                        \
        return -1;                                                                               \
    }                                                                                            \
    extern "C" NB_EXPORT PyObject* PyInit_##name() {                                             \
        if (!codeloom::MayBeLoaded(#name)) return nullptr;                                       \
        nanobind::detail::init_singletons();                                                     \
        if (!nanobind::detail::nb_backend_init(#name)) return nullptr;                           \
        static PyObject* const definition = codeloom::DefinitionThatRefuses(NB_CALL(module_new)( \
            #name, nullptr, reinterpret_cast<void*>(_Execute_##name), NB_ABI_MINOR_TAG));        \
        return definition;                                                                       \
    }                                                                                            \
    static void _Load_##name(nanobind::module_ variable)
