// host/: the only place that touches raw interpreter machinery.
//   in     the C++ classes of the system
//   out    the same classes as the host sees them: subclassable, collectable, with overrides honoured
//   keeps  nothing
//   start  at CHosted and CRef here; overrides.h for operations, binding.h for class set-up
//
// An object of the system lives inside its host object: the host object owns it, CRef owns the host object.
#pragma once

#include <string>
#include <tuple>
#include <utility>

#include <nanobind/nanobind.h>

namespace nb = nanobind;

namespace codeloom {

// Base of every class of the system. It knows the host object that it lives in.
class CHosted {
  public:
    CHosted() = default;
    CHosted(const CHosted&) = delete;
    CHosted& operator=(const CHosted&) = delete;
    virtual ~CHosted() = default;

    nb::handle Self() const { return _fSelf; }

    // Tells a new object of class T where it lives, before anything else. A class that wants to know its own
    // declares SetClass<T>().
    template <class T>
    static void Introduce(T& made, nb::handle self) {
        made._fSelf = self;
        if constexpr (requires { made.template SetClass<T>(); }) made.template SetClass<T>();
    }

  private:
    nb::handle _fSelf;  // borrowed: it owns us
};

// Raises the host's TypeError, "expected <class>, <class of found> found".
[[noreturn]] void RaiseWrongType(const char* expected, nb::handle found);

// The name of a class as the host knows it: `codeloom::CNode` is CNode, `CRef<CNode>` is CNode too.
std::string HostName(const std::type_info& type);

// Raises the host's TypeError for `called`.__init__ on an object that only `wanted`.__init__ can make.
[[noreturn]] void RaiseForeignInit(const std::type_info& called, const std::type_info& wanted,
                                   nb::handle self);

// Raises the host's AttributeError of an operation on None.
[[noreturn]] void RaiseNoneUsed(const std::type_info& wanted);

// True when the class of `candidate` is T or derived from it.
template <class T>
bool IsOfClass(nb::handle candidate) {
    static PyTypeObject* const type = reinterpret_cast<PyTypeObject*>(nb::type<T>().ptr());
    if constexpr (requires { typename T::CAnyOfKind; }) {
        // Every native class derived from it inherits this slot, and no other class has it.
        if (Py_TYPE(candidate.ptr())->tp_traverse == type->tp_traverse) return true;
    }
    return PyObject_TypeCheck(candidate.ptr(), type);
}

// The object of class T inside `candidate`; null when it is of another class or not yet constructed. Classes
// whose common base, `CAnyOfKind`, knows which one it is of are distinguished by that.
template <class T>
T* TryInstance(nb::handle candidate) {
    if constexpr (requires { typename T::CAnyOfKind; }) {
        if constexpr (!std::is_same_v<T, typename T::CAnyOfKind>) {
            const auto* const base = TryInstance<typename T::CAnyOfKind>(candidate);
            return base == nullptr ? nullptr : base->template As<T>();
        }
    }
    if (!IsOfClass<T>(candidate) || !nb::inst_ready(candidate)) return nullptr;
    return nb::inst_ptr<T>(candidate);
}

// The same; a foreign object is the host's TypeError.
template <class T>
T* Instance(nb::handle candidate) {
    T* const found = TryInstance<T>(candidate);
    if (found == nullptr) RaiseWrongType(nb::type_name(nb::type<T>()).c_str(), candidate);
    return found;
}

// Owns one reference to the host object of a T; may be empty, which the host sees as none.
template <class T>
class CRef {
  public:
    CRef() = default;
    CRef(std::nullptr_t) {}
    explicit CRef(T* object) : _fObject(object) { _Retain(); }
    CRef(const CRef& other) : CRef(other._fObject) {}
    CRef(CRef&& other) noexcept : _fObject(std::exchange(other._fObject, nullptr)) {}
    CRef& operator=(CRef other) noexcept {
        std::swap(_fObject, other._fObject);
        return *this;
    }
    ~CRef() { _Release(); }

    // Takes over the reference that `owner` holds to the host object of `object`.
    static CRef Steal(T* object, nb::object owner) {
        owner.release();
        CRef result;
        result._fObject = object;
        return result;
    }

    // The object inside a host object; none gives an empty reference, a foreign object the host's TypeError.
    static CRef FromHost(nb::handle candidate) {
        return candidate.is_none() ? CRef() : CRef(Instance<T>(candidate));
    }

    T* get() const { return _fObject; }
    explicit operator bool() const { return _fObject != nullptr; }
    T& operator*() const { return *_Checked(); }
    T* operator->() const { return _Checked(); }

    // The host's view: the object itself, or none.
    nb::object AsHost() const {
        return _fObject == nullptr ? nb::none() : nb::borrow<nb::object>(_fObject->Self());
    }

    // The reference itself, to be given to the host; the holder is empty afterwards.
    nb::object Release() {
        if (_fObject == nullptr) return nb::none();
        return nb::steal<nb::object>(std::exchange(_fObject, nullptr)->Self());
    }

    // True when nobody else holds the host object.
    bool IsOnlyReference() const { return _fObject != nullptr && Py_REFCNT(_fObject->Self().ptr()) == 1; }

    void reset() { CRef().Swap(*this); }
    void Swap(CRef& other) noexcept { std::swap(_fObject, other._fObject); }

  private:
    T* _Checked() const {
        if (_fObject == nullptr) [[unlikely]]
            RaiseNoneUsed(typeid(T));
        return _fObject;
    }
    void _Retain() const {
        if (_fObject != nullptr) _fObject->Self().inc_ref();
    }
    void _Release() const {
        if (_fObject != nullptr) _fObject->Self().dec_ref();
    }

    T* _fObject = nullptr;
};

// Empties a vector of what owns references. Dropping one may run host code, so each leaves the vector first.
template <class Vector>
void DropEach(Vector& owners) {
    while (!owners.empty()) {
        const auto dropped = std::move(owners.back());
        owners.pop_back();
    }
}

// While it lives, the collector doesn't run by itself, and with it no host code of finalizers and callbacks.
// For loops that make host objects of native ones which host code could change under them.
class CNoCollection {
  public:
    CNoCollection() : _fWasOn(PyGC_Disable()) {}
    ~CNoCollection() {
        if (_fWasOn) PyGC_Enable();
    }
    CNoCollection(const CNoCollection&) = delete;
    CNoCollection& operator=(const CNoCollection&) = delete;

  private:
    const int _fWasOn;
};

// An object that can't be part of a cycle yet costs collections nothing while they don't see it.
inline void HideFromCollector(nb::handle object) {
    PyObject_GC_UnTrack(object.ptr());
}
inline void ShowToCollector(nb::handle object) {
    if (PyObject_GC_IsTracked(object.ptr()) == 0) PyObject_GC_Track(object.ptr());
}

// Makes an object of class T in a new host object. Its constructor takes `arguments`.
template <class T, class... Arguments>
CRef<T> MakeInstance(Arguments&&... arguments) {
    static const nb::handle type = nb::type<T>();
    nb::object owner = nb::inst_alloc(type);
    T* const made = new (nb::inst_ptr<void>(owner)) T(std::forward<Arguments>(arguments)...);
    CHosted::Introduce<T>(*made, owner);
    nb::inst_mark_ready(owner);
    return CRef<T>::Steal(made, std::move(owner));
}

// The same by calling the class as the host would.
template <class T, class... Arguments>
CRef<T> NewInstance(Arguments&&... arguments) {
    return CRef<T>(Instance<T>(nb::object(nb::type<T>()(std::forward<Arguments>(arguments)...))));
}

}  // namespace codeloom

// How references to objects of the system cross the boundary.
namespace nanobind::detail {

// An object of the system knows its host object, so that handing it out needs no search.
template <class T>
struct type_caster<T, enable_if_t<std::is_base_of_v<codeloom::CHosted, T>>> : type_caster_base<T> {
    template <class U>
    static handle from_cpp(U&& value, rv_policy, cleanup_list*) noexcept {
        const codeloom::CHosted* object;
        if constexpr (std::is_pointer_v<std::remove_reference_t<U>>) {
            object = value;
        } else {
            object = &value;
        }
        return object == nullptr ? none().release() : object->Self().inc_ref();
    }
};

template <class T>
struct type_caster<codeloom::CRef<T>> {
    NB_TYPE_CASTER(codeloom::CRef<T>, make_caster<T>::Name + const_name(" | None"))

    bool from_python(handle source, uint32_t, cleanup_list*) noexcept {
        if (source.is_none()) {
            value = codeloom::CRef<T>();
            return true;
        }
        T* const object = codeloom::TryInstance<T>(source);
        if (object == nullptr) return false;
        value = codeloom::CRef<T>(object);
        return true;
    }

    static handle from_cpp(const codeloom::CRef<T>& source, rv_policy, cleanup_list*) noexcept {
        return source.AsHost().release();
    }
};

// As an argument that may be none: the signature says so by itself.
template <class T>
struct remove_opt_mono<codeloom::CRef<T>> : remove_opt_mono<T> {};

}  // namespace nanobind::detail
