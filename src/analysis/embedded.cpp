#include "analysis/embedded.h"

#include "neighbours/imported_names.h"
#include "parse/syntax_error.h"

namespace codeloom {

namespace {

const char* MessageFor(const CLogicalLine& exp_logical) {
    if (IsOfType(exp_logical, gLogicalTypes.kCommentedTypeHint))
        return "invalid syntax in commented type hint";
    if (IsOfType(exp_logical, gLogicalTypes.kStringifiedTypeHint))
        return "invalid syntax in stringified type hint";
    return "invalid syntax";
}

}  // namespace

nb::object EmbeddedError(const CLogicalLine& logical, const CLogicalLine& exp_logical, nb::handle context) {
    const nb::str message(MessageFor(exp_logical));
    const nb::object inner = CreateSyntaxError(message, exp_logical.Self(), context, nb::none());
    const nb::int_ rows_down(int64_t{exp_logical.fFirstLine} - logical.fFirstLine);
    // The message replaces the file name too.
    return nb::borrow(PyExc_SyntaxError)(message, nb::make_tuple(message, rows_down + inner.attr("lineno"),
                                                                 inner.attr("offset"), inner.attr("text")));
}

void LiftTypeEquivs(const CLogicalLine& exp_logical, CLogicalLine& logical) {
    exp_logical.fTypeEquivs.ForEach(
        [&](nb::handle name, nb::handle equiv) { logical.AppendTypeEquiv(name, equiv); });
}

}  // namespace codeloom
