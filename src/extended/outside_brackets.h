// Going through the tokens of a line that are outside brackets.
#pragma once

#include "host/collections.h"
#include "host/text.h"
#include "parse/token_search.h"

namespace codeloom {

// Calls visit(index, text) for each token in [start, end) outside brackets, closing brackets not among them,
// until it returns false. Comments, backslashes and removed tokens are passed over, and what is between
// a `lambda` and its `:`.
template <class Visit>
void ForEachOutsideBrackets(const nb::tuple& toks, Py_ssize_t start, Py_ssize_t end, Visit visit) {
    int depth = 0, lambda_count = 0;
    for (Py_ssize_t i = start; i < end; ++i) {
        const nb::handle tok = TupleItem(toks, i);
        if (tok.is_none()) continue;
        const CUtf8 text(tok);
        if (IsPassedOver(text)) continue;
        const int step = DepthStep(text);
        if (depth == 0 && text == "lambda") {
            ++lambda_count;
        } else if (depth == 0 && lambda_count != 0) {
            lambda_count -= text == ":";
        } else if (depth == 0 && step >= 0 && !visit(i, static_cast<std::string_view>(text))) {
            return;
        }
        depth += step;
    }
}

}  // namespace codeloom
