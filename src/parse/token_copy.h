// Copies of a token tuple: a part of it, or all with some tokens removed. A removed token is none, so that
// the indexes of the others stay.
#pragma once

#include "host/collections.h"

namespace codeloom {

inline nb::tuple WithoutTokens(const nb::tuple& toks, Py_ssize_t start, Py_ssize_t end) {
    return MakeTuple(TupleSize(toks), [&](Py_ssize_t i) -> nb::object {
        return start <= i && i < end ? nb::none() : nb::borrow(TupleItem(toks, i));
    });
}

// The items in [start, end); none is the host's TypeError.
inline nb::tuple ItemsBetween(const nb::object& items, Py_ssize_t start, Py_ssize_t end) {
    return nb::tuple(nb::object(items[nb::slice(start, end)]));
}

}  // namespace codeloom
