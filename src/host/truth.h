// Booleans as the host gives them: whatever is given where one is asked for counts by its truth value.
#pragma once

#include <nanobind/nanobind.h>

#include "host/collections.h"

namespace codeloom {

// A boolean argument of a bound function. What its truth value raises is raised inside the function.
struct CTruth {
    nb::handle value;

    operator bool() const { return IsTrue(value); }
};

}  // namespace codeloom

namespace nanobind::detail {

template <>
struct has_arg_defaults<codeloom::CTruth> : std::true_type {};  // None is a truth value too

template <>
struct type_caster<codeloom::CTruth> {
    NB_TYPE_CASTER(codeloom::CTruth, const_name("bool"))

    bool from_python(handle source, uint32_t, cleanup_list*) noexcept {
        value.value = source;
        return true;
    }
};

}  // namespace nanobind::detail
