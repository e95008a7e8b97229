// The children of a node, for operations that take them for granted.
#pragma once

#include "host/errors.h"
#include "tree/node.h"

namespace codeloom {

// The number of children; TypeError for a leaf.
inline Py_ssize_t ListedCount(const CNode& node) {
    if (node.fChildren.IsNone()) RaiseHost(PyExc_TypeError, "'NoneType' object is not a list of children");
    return node.fChildren.Size();
}

}  // namespace codeloom
