// Hints as comments hold them: cut out of the comment, and brought into a form that parses.
// Every place is a byte offset into the comment from end to end.
#pragma once

#include <nanobind/nanobind.h>

#include "host/or_none.h"
#include "host/pair.h"

namespace codeloom {

// What makes a comment one that may hold a hint.
bool HoldsTypeMark(nb::handle comment);

// The hint in a comment, after as many blanks as there are bytes before it; None for a comment that is
// no hint, or a bare `type: ignore`.
CTextOrNone AlignedHintInComment(const nb::str& comment);

// The hint of a function made parsable: the tokens, and for each the offset in the hint that it stands for.
struct CRewrittenHint {
    nb::list toks;
    nb::list utf8_offsets;
};

// `(int, str) -> bool` as a `def` with a dummy name for each parameter; of `(...) -> bool` none is left.
CRewrittenHint RewriteFunctionHint(const nb::str& hint);

}  // namespace codeloom

namespace nanobind::detail {

template <>
struct type_caster<codeloom::CRewrittenHint> : pair_caster<codeloom::CRewrittenHint, list, list> {};

}  // namespace nanobind::detail
