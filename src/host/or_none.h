// An object of the host that may be none, with the kind in its type and in the host's signatures:
// TOrNone<nb::str> reads `str | None`.
#pragma once

#include <nanobind/nanobind.h>

namespace nb = nanobind;

namespace codeloom {

template <class Kind>
class TOrNone : public nb::object {
  public:
    static constexpr auto Name = Kind::Name + nb::detail::const_name(" | None");

    TOrNone() : nb::object(nb::none()) {}
    TOrNone(nb::object value) : nb::object(std::move(value)) {}
    TOrNone(nb::handle value, nb::detail::borrow_t) : nb::object(value, nb::detail::borrow_t()) {}
    TOrNone(nb::handle value, nb::detail::steal_t) : nb::object(value, nb::detail::steal_t()) {}

    static bool check_(nb::handle value) { return value.is_none() || nb::isinstance<Kind>(value); }
};

using CTextOrNone = TOrNone<nb::str>;
using CBytesOrNone = TOrNone<nb::bytes>;

}  // namespace codeloom
