// Operations that a host subclass may override.
//   in     a class that lists its virtual operations
//   out    native code that calls an operation reaches the override of a host subclass, at every depth; the
//          bound operation is the class's own, so that super() reaches the base exactly once
//
// A class lists its operations, each declared, explained and bound in one place:
//     class CStmt : public CNode {
//       public:
//         OPERATIONS_OF(CStmt, CNode)
//         OPERATION(CNodeRef, GetChild, (Py_ssize_t child_i), "The child at an index; None past the end.",
//                   "child_i"_a);
//         END_OPERATIONS
//       ...
// An OPERATION declares a virtual function; a body may follow it instead of the semicolon. A class
// without bases says CNoOperations. A class without operations of its own lists nothing, and one that
// overrides an operation natively declares it as any other function: both are bound as they should be.
// THostSubclass<CStmt> is CStmt with an override for each operation, its own and inherited.
// An instance of a native class never pays for this: only instances of host subclasses are made of
// THostSubclass.
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

    // Calls the operation of `self`; `count` arguments follow it in `stack`, whose first entry is
    // `self`.
    nb::object Call(PyObject* const* stack, size_t count) const;

    // Raises the host's TypeError, "<class>.<operation> must return <wanted>, not <class of result>".
    [[noreturn]] void RaiseWrongResult(nb::handle self, const std::string& wanted, nb::handle result) const;

  private:
    PyObject* _fName;  // interned, for the life of the process
};

// What a T is to the host: the name of a class, or the type as signatures write it, where "%" stands for a
// class. For an integer its size says why one may not do.
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

// One line of a class's list of operations; a line without an operation does nothing.
template <int line>
struct TOperationLine {};

// What a class without bases names as its base.
struct CNoOperations {
    template <class Class>
    struct TOverridden {
        using Type = Class;
    };
    template <class Class, class Visitor>
    static void VisitOperations(Visitor&&) {}
};

// Class with overrides for the operations of Base.
template <class Base, class Class>
using TOverriddenBy = typename Base::template TOverridden<Class>::Type;

template <class Class>
using THostSubclass = TOverriddenBy<Class, Class>;

}  // namespace codeloom

#define OPERATIONS_OF(Self, Base)                 \
    using COperationsBase = Base;                 \
    template <class Class, class Below, int line> \
    struct TOverrideAt {                          \
        using Type = Below;                       \
    };                                            \
    template <class Class, class Visitor>         \
    static void _Operation(Visitor&&, ...) {}     \
    static constexpr int kFirstOperationLine = __LINE__;

// Below, with the overrides of each line from the first to the last.
#define END_OPERATIONS                                                                                     \
    static constexpr int kLastOperationLine = __LINE__;                                                    \
    template <class Class, class Below, int line>                                                          \
    struct TOverriddenFrom {                                                                               \
        using Next = typename TOverrideAt<Class, Below, line>::Type;                                       \
        using Type = typename TOverriddenFrom<Class, Next, line + 1>::Type;                                \
    };                                                                                                     \
    template <class Class, class Below>                                                                    \
    struct TOverriddenFrom<Class, Below, kLastOperationLine> {                                             \
        using Type = Below;                                                                                \
    };                                                                                                     \
    template <class Class>                                                                                 \
    struct TOverridden                                                                                     \
        : TOverriddenFrom<Class, codeloom::TOverriddenBy<COperationsBase, Class>, kFirstOperationLine> {}; \
    template <class Class, class Visitor, int... offset>                                                   \
    static void _VisitLines(Visitor&& visit, std::integer_sequence<int, offset...>) {                      \
        (_Operation<Class>(visit, codeloom::TOperationLine<kFirstOperationLine + offset>{}), ...);         \
    }                                                                                                      \
    /* Calls visit(name, DeclaringClass, function, doc, arguments...) for each operation. */               \
    template <class Class, class Visitor>                                                                  \
    static void VisitOperations(Visitor&& visit) {                                                         \
        COperationsBase::template VisitOperations<Class>(visit);                                           \
        _VisitLines<Class>(visit,                                                                          \
                           std::make_integer_sequence<int, kLastOperationLine - kFirstOperationLine>{});   \
    }

// OPERATION(Result, Name, (parameters), doc, "argument"_a, "optional_argument"_a = value...): one nb::arg for
// each parameter.
#define OPERATION(Result, Name, parameters, doc, ...)                                         \
    template <class Class, class Below>                                                       \
    struct TOverrideAt<Class, Below, __LINE__> {                                              \
        class Type : public Below {                                                           \
          public:                                                                             \
            _CODELOOM_OVERRIDE(Name, _CODELOOM_COUNT(__VA_ARGS__))                            \
        };                                                                                    \
    };                                                                                        \
    template <class Class, class Visitor>                                                     \
    static void _Operation(Visitor&& visit, codeloom::TOperationLine<__LINE__>) {             \
        using Traits = codeloom::TOperationTraits<decltype(&Class::Name)>;                    \
        constexpr auto call = [](Class& self, auto&&... arguments) -> decltype(auto) {        \
            return self.Class::Name(std::forward<decltype(arguments)>(arguments)...);         \
        };                                                                                    \
        visit(#Name, static_cast<typename Traits::DeclaringClass*>(nullptr),                  \
              typename Traits::template CBound<Class, std::remove_const_t<decltype(call)>>{}, \
              doc __VA_OPT__(, ) __VA_ARGS__);                                                \
    }                                                                                         \
    virtual Result Name parameters

// Part<Below> is derived from Below: what instances of host subclasses do besides.
#define FOR_HOST_SUBCLASSES(Part)                \
    template <class Class, class Below>          \
    struct TOverrideAt<Class, Below, __LINE__> { \
        using Type = Part<Below>;                \
    };

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
