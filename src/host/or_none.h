// Objects of the host that may be of more than one kind, none among them, with the kinds in the type and in
// the host's signatures: TOrNone<nb::str> reads `str | None`.
#pragma once

#include <nanobind/nanobind.h>

namespace nb = nanobind;

namespace codeloom {

template <class Kind>
class TOrNone : public nb::object {
  public:
    static constexpr auto Name =
        Kind::Name + nb::detail::const_name(" | None");  // NOLINT: the binding wants the name

    TOrNone() : nb::object(nb::none()) {}
    TOrNone(nb::object value) : nb::object(std::move(value)) {}
    TOrNone(nb::handle value, nb::detail::borrow_t) : nb::object(value, nb::detail::borrow_t()) {}
    TOrNone(nb::handle value, nb::detail::steal_t) : nb::object(value, nb::detail::steal_t()) {}

    static bool check_(nb::handle value) { return value.is_none() || nb::isinstance<Kind>(value); }
};

// A text string, or its UTF-8 form as a byte string.
class CTextOrUtf8 : public nb::object {
  public:
    static constexpr auto Name = nb::detail::const_name("str | bytes");  // NOLINT: likewise

    CTextOrUtf8() = default;
    CTextOrUtf8(nb::handle value) : nb::object(nb::borrow<nb::object>(value)) {}
    CTextOrUtf8(nb::object value) : nb::object(std::move(value)) {}
    CTextOrUtf8(nb::handle value, nb::detail::borrow_t) : nb::object(value, nb::detail::borrow_t()) {}
    CTextOrUtf8(nb::handle value, nb::detail::steal_t) : nb::object(value, nb::detail::steal_t()) {}

    static bool check_(nb::handle value) {
        return nb::isinstance<nb::str>(value) || nb::isinstance<nb::bytes>(value);
    }
};

using CTextOrNone = TOrNone<nb::str>;
using CBytesOrNone = TOrNone<nb::bytes>;
using CTextOrUtf8OrNone = TOrNone<CTextOrUtf8>;

}  // namespace codeloom

namespace nanobind::detail {

// As an argument: the signature says by itself that it may be none.
template <class Kind>
struct remove_opt_mono<codeloom::TOrNone<Kind>> : remove_opt_mono<Kind> {};

}  // namespace nanobind::detail
