// Operations that a host subclass may override.
//   in     a class with virtual operations, and beside it a mixin that lists them
//   out    native code that calls an operation reaches the override of a host subclass, at every depth; the
//          bound operation is the class's own, so that super() reaches the base exactly once
//
// A mixin reads
//     template <class Class>
//     class TNodeOperations : public Class {
//         FIRST_OPERATIONS
//         OPERATION(GetChild, "The child at an index; none past the end.", "child_i"_a)
//         END_OPERATIONS
//     };
// and the mixin of a derived class
//     template <class Class>
//     class TStmtOperations : public TNodeOperations<Class> {
//         OPERATIONS_BEYOND(TNodeOperations<Class>)
//         ...
// An instance of a native class never pays for this: only instances of host subclasses are made of the mixin.
// The lookup goes by the type, through the interpreter's own cache, so that an operation assigned to the
// subclass later is honoured, and one put into an instance's own dictionary isn't seen.
#pragma once

#include <string>
#include <string_view>

#include <nanobind/nanobind.h>

#include "host/hosted.h"
#include "host/index.h"
#include "host/truth.h"

namespace codeloom {

using namespace nb::literals;

// The name of one operation, ready for lookups.
class CHostOperation {
  public:
    explicit CHostOperation(const char* name);

    // True when the type of `self` has another function under this name than `native_type`.
    bool IsOverridden(nb::handle self, nb::handle native_type) const;

    // Calls the operation of `self`; `count` arguments stand behind it in `stack`, whose first entry is
    // `self`.
    nb::object Call(PyObject* const* stack, size_t count) const;

    // Raises the host's TypeError, "<class>.<operation> must return <wanted>, not <class of result>".
    [[noreturn]] void RaiseWrongResult(nb::handle self, const std::string& wanted, nb::handle result) const;

  private:
    PyObject* _fName;  // interned, for the life of the process
};

// What a T is to the host: the name of a class, or the type as signatures write it, where "%" stands for a
// class. Of an integer its size tells why one may not do.
template <class T>
std::string HostTypeName() {
    constexpr std::string_view name = nb::detail::make_caster<T>::Name.text;
    if (std::is_integral_v<T> && sizeof(T) > 1) return "int of " + std::to_string(8 * sizeof(T)) + " bits";
    return name.find('%') == std::string_view::npos ? std::string(name) : HostName(typeid(T));
}

// How a parameter of this type is bound, and what a result of it is read as.
template <class Type>
using TBound = std::conditional_t<std::is_same_v<Type, bool>, CTruth,
                                  std::conditional_t<std::is_same_v<Type, Py_ssize_t>, CIndex, Type>>;

// A value of the host's as a T; a wrong kind is the host's TypeError.
template <class T>
T ResultFromHost(nb::object result) {
    TBound<T> value{};
    if (!nb::try_cast(result, value)) RaiseWrongType(HostTypeName<T>().c_str(), result);
    return value;
}

template <class Result, class... Arguments>
Result CallOverride(const CHostOperation& operation, nb::handle self, Arguments&&... arguments) {
    nb::object owners[] = {nb::borrow<nb::object>(self), nb::cast(std::forward<Arguments>(arguments))...};
    PyObject* stack[sizeof...(Arguments) + 1];
    for (size_t i = 0; i <= sizeof...(Arguments); ++i) stack[i] = owners[i].ptr();
    const nb::object result = operation.Call(stack, sizeof...(Arguments));
    if constexpr (std::is_base_of_v<nb::handle, Result>) {
        return Result(result);
    } else if constexpr (!std::is_void_v<Result>) {
        TBound<Result> value{};
        if (!nb::try_cast(result, value)) operation.RaiseWrongResult(self, HostTypeName<Result>(), result);
        return value;
    }
}

// The parts of an operation's type.
template <class Pointer>
struct TOperationTraits;
template <class Owner, class Result_, class... Arguments>
struct TOperationTraits<Result_ (Owner::*)(Arguments...)> {
    using DeclaringClass = Owner;
    using Result = Result_;
    template <size_t i>
    using Argument = std::tuple_element_t<i, std::tuple<Arguments...>>;

    // A function object for the binding, with `Caller` as its body.
    template <class Class, class Caller>
    struct CBound {
        Result operator()(Class& self, TBound<Arguments>... arguments) const {
            return Caller{}(self, std::forward<TBound<Arguments>>(arguments)...);
        }
    };
};

// One line of a mixin's list of operations; a line without an operation does nothing.
template <int line>
struct TOperationLine {};

}  // namespace codeloom

#define FIRST_OPERATIONS                      \
  public:                                     \
    template <class Visitor>                  \
    static void _VisitInherited(Visitor&&) {} \
    _CODELOOM_OPERATIONS

#define OPERATIONS_BEYOND(...)                     \
  public:                                          \
    template <class Visitor>                       \
    static void _VisitInherited(Visitor&& visit) { \
        __VA_ARGS__::VisitOperations(visit);       \
    }                                              \
    _CODELOOM_OPERATIONS

#define _CODELOOM_OPERATIONS                  \
    template <class Visitor>                  \
    static void _Operation(Visitor&&, ...) {} \
    static constexpr int _kFirstLine = __LINE__;

#define END_OPERATIONS                                                                       \
    static constexpr int _kEndLine = __LINE__;                                               \
    template <class Visitor, int... offset>                                                  \
    static void _VisitLines(Visitor&& visit, std::integer_sequence<int, offset...>) {        \
        (_Operation(visit, codeloom::TOperationLine<_kFirstLine + offset>{}), ...);          \
    }                                                                                        \
    /* Calls visit(name, DeclaringClass, function, doc, arguments...) for each operation. */ \
    template <class Visitor>                                                                 \
    static void VisitOperations(Visitor&& visit) {                                           \
        _VisitInherited(visit);                                                              \
        _VisitLines(visit, std::make_integer_sequence<int, _kEndLine - _kFirstLine>{});      \
    }

// OPERATION(Name, doc, "argument"_a, "optional_argument"_a = value...): one nb::arg for each parameter.
#define OPERATION(Name, doc, ...)                                                             \
    _CODELOOM_OVERRIDE(Name, _CODELOOM_COUNT(__VA_ARGS__))                                    \
    template <class Visitor>                                                                  \
    static void _Operation(Visitor&& visit, codeloom::TOperationLine<__LINE__>) {             \
        using Traits = codeloom::TOperationTraits<decltype(&Class::Name)>;                    \
        constexpr auto call = [](Class& self, auto&&... arguments) -> decltype(auto) {        \
            return self.Class::Name(std::forward<decltype(arguments)>(arguments)...);         \
        };                                                                                    \
        visit(#Name, static_cast<typename Traits::DeclaringClass*>(nullptr),                  \
              typename Traits::template CBound<Class, std::remove_const_t<decltype(call)>>{}, \
              doc __VA_OPT__(, ) __VA_ARGS__);                                                \
    }

#define _CODELOOM_COUNT(...) _CODELOOM_COUNT_OF(0 __VA_OPT__(, ) __VA_ARGS__, 6, 5, 4, 3, 2, 1, 0)
#define _CODELOOM_COUNT_OF(_0, _1, _2, _3, _4, _5, _6, count, ...) count
#define _CODELOOM_OVERRIDE(Name, count) _CODELOOM_OVERRIDE_OF(Name, count)
#define _CODELOOM_OVERRIDE_OF(Name, count) _CODELOOM_OVERRIDE_##count(Name)
#define _CODELOOM_PARAMETER(Name, i) \
    typename codeloom::TOperationTraits<decltype(&Class::Name)>::template Argument<i> argument_##i
#define _CODELOOM_OVERRIDE_BODY(Name, ...)                                                             \
    {                                                                                                  \
        static const codeloom::CHostOperation operation(#Name);                                        \
        if (!operation.IsOverridden(this->Self(), nb::type<Class>())) return Class::Name(__VA_ARGS__); \
        using Result = typename codeloom::TOperationTraits<decltype(&Class::Name)>::Result;            \
        return codeloom::CallOverride<Result>(operation, this->Self() __VA_OPT__(, ) __VA_ARGS__);     \
    }
#define _CODELOOM_RESULT(Name) typename codeloom::TOperationTraits<decltype(&Class::Name)>::Result
#define _CODELOOM_OVERRIDE_0(Name) _CODELOOM_RESULT(Name) Name() override _CODELOOM_OVERRIDE_BODY(Name)
#define _CODELOOM_OVERRIDE_1(Name) \
    _CODELOOM_RESULT(Name)         \
    Name(_CODELOOM_PARAMETER(Name, 0)) override _CODELOOM_OVERRIDE_BODY(Name, argument_0)
#define _CODELOOM_OVERRIDE_2(Name)                                                                     \
    _CODELOOM_RESULT(Name)                                                                             \
    Name(_CODELOOM_PARAMETER(Name, 0), _CODELOOM_PARAMETER(Name, 1)) override _CODELOOM_OVERRIDE_BODY( \
        Name, argument_0, argument_1)
#define _CODELOOM_OVERRIDE_3(Name)                                                                          \
    _CODELOOM_RESULT(Name)                                                                                  \
    Name(_CODELOOM_PARAMETER(Name, 0), _CODELOOM_PARAMETER(Name, 1), _CODELOOM_PARAMETER(Name, 2)) override \
    _CODELOOM_OVERRIDE_BODY(Name, argument_0, argument_1, argument_2)
#define _CODELOOM_OVERRIDE_4(Name)                                                                 \
    _CODELOOM_RESULT(Name)                                                                         \
    Name(_CODELOOM_PARAMETER(Name, 0), _CODELOOM_PARAMETER(Name, 1), _CODELOOM_PARAMETER(Name, 2), \
         _CODELOOM_PARAMETER(Name, 3)) override                                                    \
    _CODELOOM_OVERRIDE_BODY(Name, argument_0, argument_1, argument_2, argument_3)
#define _CODELOOM_OVERRIDE_5(Name)                                                                 \
    _CODELOOM_RESULT(Name)                                                                         \
    Name(_CODELOOM_PARAMETER(Name, 0), _CODELOOM_PARAMETER(Name, 1), _CODELOOM_PARAMETER(Name, 2), \
         _CODELOOM_PARAMETER(Name, 3), _CODELOOM_PARAMETER(Name, 4)) override                      \
    _CODELOOM_OVERRIDE_BODY(Name, argument_0, argument_1, argument_2, argument_3, argument_4)
#define _CODELOOM_OVERRIDE_6(Name)                                                                          \
    _CODELOOM_RESULT(Name)                                                                                  \
    Name(_CODELOOM_PARAMETER(Name, 0), _CODELOOM_PARAMETER(Name, 1), _CODELOOM_PARAMETER(Name, 2),          \
         _CODELOOM_PARAMETER(Name, 3), _CODELOOM_PARAMETER(Name, 4), _CODELOOM_PARAMETER(Name, 5)) override \
    _CODELOOM_OVERRIDE_BODY(Name, argument_0, argument_1, argument_2, argument_3, argument_4, argument_5)
