// Class set-up: constructors in two steps, operations bound, and collection.
#pragma once

#include <nanobind/nanobind.h>

#include "host/overrides.h"

namespace codeloom {

// An object has room for what its nearest native class makes, and for nothing else. TypeError when that is
// not Class, whose `__init__` was called.
template <class Class>
void RequireOwnInit(nb::handle self) {
    const std::type_info& wanted = nb::type_info(self.type());
    if (wanted != typeid(Class)) RaiseForeignInit(typeid(Class), wanted, self);
}

// `__init__` of a class: makes the object, then calls its Init(arguments...). By then the object is complete,
// so that overrides of a host subclass work in Init, as they do in a host constructor.
template <class... Arguments>
struct TInit : nb::def_visitor<TInit<Arguments...>> {
    template <class Binding, class... Extra>
    void execute(Binding& binding, const Extra&... extra) {
        using Class = typename Binding::Type;
        using HostSubclass = typename Binding::Alias;
        binding.def(
            "__init__",
            [](nb::pointer_and_handle<Class> self, TBound<Arguments>... arguments) {
                RequireOwnInit<Class>(self.h);
                Class* const made =
                    nb::inst_python_derived(self.h) ? new (self.p) HostSubclass : new (self.p) Class;
                CHosted::Introduce<Class>(*made, self.h);
                nb::inst_mark_ready(self.h);
                made->Init(std::forward<TBound<Arguments>>(arguments)...);
            },
            extra...);
    }
};

// Binds the operations that a class itself declares, whether new in it or native overrides of its bases'.
template <class Binding>
void BindOperations(Binding& binding) {
    using Class = typename Binding::Type;
    Class::template VisitOperations<Class>(
        [&]<class Declaring>(const char* name, Declaring*, auto function, const auto&... extra) {
            if constexpr (std::is_same_v<Declaring, Class>) binding.def(name, function, extra...);
        });
}

// Collection. A class that holds host references has a member function
//     template <class Visitor> void References(Visitor&& visit) { visit(_fParser); visit(fChildren); ... }
// which names all of them, those of its base included.
struct CTraverseReferences {
    visitproc visit;
    void* argument;
    int result = 0;

    void operator()(const nb::handle& reference) {
        if (result == 0 && reference.is_valid()) result = visit(reference.ptr(), argument);
    }
    template <class T>
    void operator()(const CRef<T>& reference) {
        if (reference) (*this)(reference->Self());
    }
};

struct CClearReferences {
    void operator()(nb::object& reference) const {
        nb::object dropped = std::exchange(reference, nb::none());
    }
    template <class T>
    void operator()(CRef<T>& reference) const {
        CRef<T> dropped = std::move(reference);
    }
};

template <class Class>
int Traverse(PyObject* self, visitproc visit, void* arg) {
    Py_VISIT(Py_TYPE(self));
    if (!nb::inst_ready(self)) return 0;
    CTraverseReferences references{visit, arg};
    nb::inst_ptr<Class>(self)->References(references);
    return references.result;
}

template <class Class>
int ClearCollected(PyObject* self) {
    if (nb::inst_ready(self)) nb::inst_ptr<Class>(self)->References(CClearReferences{});
    return 0;
}

// An object that changed its class would be taken for the other one natively too.
inline PyObject* ClassOf(PyObject* self, void*) {
    return Py_NewRef(Py_TYPE(self));
}
inline PyGetSetDef kFixedClass[] = {{"__class__", ClassOf, nullptr, nullptr, nullptr}, {}};

// The slots of a collected class, for nb::type_slots.
template <class Class>
inline PyType_Slot kCollectedSlots[] = {
    {Py_tp_traverse, reinterpret_cast<void*>(Traverse<Class>)},
    {Py_tp_clear, reinterpret_cast<void*>(ClearCollected<Class>)},
    {Py_tp_getset, kFixedClass},
    {0, nullptr},
};

// The same for a class that holds no references.
inline PyType_Slot kPlainSlots[] = {{Py_tp_getset, kFixedClass}, {0, nullptr}};
inline nb::type_slots Plain() {
    return nb::type_slots(kPlainSlots);
}

template <class Class>
nb::type_slots Collected() {
    return nb::type_slots(kCollectedSlots<Class>);
}

}  // namespace codeloom
