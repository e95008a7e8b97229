// Syntax errors: the host's SyntaxError for a place in a logical line.
#pragma once

#include <nanobind/nanobind.h>

namespace nb = nanobind;

namespace codeloom {

// Makes, and doesn't raise, a SyntaxError at `context`: a token index, or a (row, column) tuple. An index
// past the last token stands for the place just after it. `pos_info_in_tok` (lineno, utf8_col) refines the
// place within the token, unless it is None. `logical` is read by attribute.
nb::object CreateSyntaxError(nb::handle msg, nb::handle logical, nb::handle context,
                             nb::handle pos_info_in_tok);

// The next token after index `i` that is neither a comment nor a backslash, as a text string; none at the
// end.
nb::object NextNonRemovedTokenInTuple(nb::handle toks, Py_ssize_t i);

void BindSyntaxError(nb::module_& module);

}  // namespace codeloom
