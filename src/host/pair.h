// A plain struct of two members that the host sees as a tuple of two:
//     template <>
//     struct type_caster<CPlace> : pair_caster<CPlace, int, int> {};
#pragma once

#include <utility>

#include <nanobind/nanobind.h>
#include <nanobind/stl/pair.h>

namespace nanobind::detail {

template <class Struct, class First, class Second>
struct pair_caster {  // NOLINT: named as the others of its kind are
    NB_TYPE_CASTER(Struct, (make_caster<std::pair<First, Second>>::Name))

    bool from_python(handle source, uint32_t flags, cleanup_list* cleanup) noexcept {
        make_caster<std::pair<First, Second>> members;
        if (!members.from_python(source, flags, cleanup)) return false;
        auto [first, second] = static_cast<std::pair<First, Second>>(members);
        value = Struct{std::move(first), std::move(second)};
        return true;
    }

    static handle from_cpp(const Struct& source, rv_policy policy, cleanup_list* cleanup) noexcept {
        const auto& [first, second] = source;
        return make_caster<std::pair<First, Second>>::from_cpp(std::pair<First, Second>(first, second),
                                                               policy, cleanup);
    }
};

}  // namespace nanobind::detail
