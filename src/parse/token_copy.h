// Copies of a token tuple with some tokens removed. A removed token is none, so that the indexes of the
// others stay.
#pragma once

#include "host/collections.h"

namespace codeloom {

inline nb::tuple WithoutTokens(const nb::tuple& toks, Py_ssize_t start, Py_ssize_t end) {
    return MakeTuple(TupleSize(toks), [&](Py_ssize_t i) -> nb::object {
        return start <= i && i < end ? nb::none() : nb::borrow(TupleItem(toks, i));
    });
}

// The first `count` items; none is the host's TypeError.
inline nb::tuple FirstItems(const nb::object& items, Py_ssize_t count) {
    return nb::tuple(nb::object(items[nb::slice(count)]));
}

}  // namespace codeloom
