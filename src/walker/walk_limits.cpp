#include "walker/walk_limits.h"

#include "host/errors.h"

namespace codeloom {

void RaiseTooManyVisits() {
    RaiseHost(PyExc_RuntimeError, "Maximum number of calls to _VisitNode exceeded");
}

void RaiseTooDeep() {
    RaiseHost(PyExc_RuntimeError, "Maximum recurse count in _VisitNode exceeded");
}

void RaiseWalkInProgress() {
    RaiseHost(PyExc_ValueError, "Only one logical may be walked at a time");
}

}  // namespace codeloom
