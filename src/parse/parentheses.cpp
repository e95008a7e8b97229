#include "parse/parentheses.h"

#include <algorithm>

#include "tree/recycling.h"

namespace codeloom {

nb::tuple InParentheses(const nb::tuple& toks, Py_ssize_t open_i, Py_ssize_t close_i) {
    return MakeTuple(std::max(TupleSize(toks), close_i + 1), [&](Py_ssize_t i) -> nb::object {
        if (i == close_i) return nb::str(")");
        return i == open_i ? nb::str("(") : nb::borrow(TupleItem(toks, i));
    });
}

CNodeRef WithoutParentheses(CNodeRef node) {
    if (!node || node->GetChildCount() != 3) return node;
    if (!node->GetChildText(0).equal(nb::str("(")) || !node->GetChildText(2).equal(nb::str(")"))) return node;
    CNodeRef inner = node->fChildren.Remove(1);
    FinishedWithNode(node->Self());
    return inner;
}

}  // namespace codeloom
