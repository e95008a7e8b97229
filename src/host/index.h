// Indexes and counts as the host gives them, cut to a range in which native code reckons on without overflow.
// Nothing has as many items.
#pragma once

#include <algorithm>

#include <nanobind/nanobind.h>

namespace codeloom {

struct CIndex {
    CIndex() = default;
    CIndex(Py_ssize_t index) : value(std::clamp<Py_ssize_t>(index, -kFarthest, kFarthest)) {}

    operator Py_ssize_t() const { return value; }

    static constexpr Py_ssize_t kFarthest = PY_SSIZE_T_MAX / 2;

    Py_ssize_t value = 0;
};

}  // namespace codeloom

namespace nanobind::detail {

template <>
struct type_caster<codeloom::CIndex> {
    NB_TYPE_CASTER(codeloom::CIndex, make_caster<Py_ssize_t>::Name)

    bool from_python(handle source, uint32_t flags, cleanup_list* cleanup) noexcept {
        make_caster<Py_ssize_t> index;
        if (!index.from_python(source, flags, cleanup)) return false;
        value = index.value;
        return true;
    }

    static handle from_cpp(const codeloom::CIndex& source, rv_policy policy, cleanup_list* cleanup) noexcept {
        return make_caster<Py_ssize_t>::from_cpp(Py_ssize_t{source}, policy, cleanup);
    }
};

}  // namespace nanobind::detail
