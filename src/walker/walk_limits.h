// The limits of a walk over one logical line, and how a walk ends that breaks them.
#pragma once

#include <nanobind/nanobind.h>

#include "host/errors.h"

namespace nb = nanobind;

namespace codeloom {

constexpr int kMaxVisits = 10000;
constexpr int kMaxRecurseCount = 40;

[[noreturn]] void RaiseTooManyVisits();
[[noreturn]] void RaiseTooDeep();
[[noreturn]] void RaiseWalkInProgress();

// The visits of one walk, held against the limits: first their number, then the depth of each.
class CVisitLimits {
  public:
    void Reset() { _fVisitCount = 0; }

    void CountVisit() {
        if (++_fVisitCount > kMaxVisits) RaiseTooManyVisits();
    }

    // `depth` is 1 at the root.
    static void CheckDepth(Py_ssize_t depth) {
        if (depth > kMaxRecurseCount) RaiseTooDeep();
    }

  private:
    int _fVisitCount = 0;
};

// Runs `walk`. The host's RuntimeError ends the walk with a printed line, as though it had ended normally.
template <class Walk>
void RunLimited(Walk walk) {
    try {
        walk();
    } catch (nb::python_error& error) {
        if (!error.matches(PyExc_RuntimeError)) throw;
        PrintReport(nb::str("RuntimeError raised in CNodeWalker.Walk: {}").format(nb::repr(error.value())));
    }
}

}  // namespace codeloom
