// Failures at the boundary: raising the host's exceptions, and the exception that is being handled.
#pragma once

#include <nanobind/nanobind.h>

namespace nb = nanobind;

namespace codeloom {

// Raises AssertionError, unless the host runs with assertions off (-O). For what the definition of an
// operation requires of its arguments; what the system requires of itself is an assert().
void HostAssert(bool condition);

// The same with `make_value()` as the argument of the exception.
template <class MakeValue>
void HostAssert(bool condition, MakeValue make_value);

// The same for an operation that reports failure by a reserved value: false, with the exception pending.
bool HostAssertHolds(bool condition);

// True when the host runs with assertions on.
bool HostAssertionsOn();

// Raises an exception of the host class `type` with `message`.
[[noreturn]] void RaiseHost(nb::handle type, const char* message);
[[noreturn]] void RaiseHost(nb::handle type, nb::handle value);

// Prints a report as the host's print() does, which is silent where there is no standard output.
void PrintReport(nb::handle line);

// Raises an exception that is made already; TypeError for what isn't an exception.
[[noreturn]] void RaiseHostError(nb::handle error);

template <class MakeValue>
void HostAssert(bool condition, MakeValue make_value) {
    if (!condition && HostAssertionsOn()) RaiseHost(PyExc_AssertionError, make_value());
}

// Counts one level of native recursion against the host's limit. RecursionError past that, and where the
// thread's own stack comes to its end, whatever the limit.
class CRecursionScope {
  public:
    CRecursionScope();
    ~CRecursionScope();
    CRecursionScope(const CRecursionScope&) = delete;
    CRecursionScope& operator=(const CRecursionScope&) = delete;
};

// An exception on its way, as the host's object. A C++ exception becomes the host's as it would at the
// boundary.
class CHostError {
  public:
    // Takes the C++ exception that is being handled; call it inside a catch block.
    static CHostError Current();

    nb::object Value() const { return _fValue; }
    bool Is(nb::handle type) const;
    [[noreturn]] void Raise() const;

  private:
    explicit CHostError(nb::object value) : _fValue(std::move(value)) {}

    nb::object _fValue;
};

// While it lives, `sys.exc_info()` of the host gives `error`, as inside an except clause.
class CHandlingScope {
  public:
    explicit CHandlingScope(const CHostError& error);
    ~CHandlingScope();
    CHandlingScope(const CHandlingScope&) = delete;
    CHandlingScope& operator=(const CHandlingScope&) = delete;

  private:
    nb::object _fPrevious;
};

}  // namespace codeloom
