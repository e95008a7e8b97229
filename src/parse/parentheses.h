// Tokens that are parsed as an expression in parentheses which aren't in the source.
#pragma once

#include "tree/node.h"

namespace codeloom {

// The tokens with parentheses in the places `open_i` and `close_i`, which may be the one after the last.
nb::tuple InParentheses(const nb::tuple& toks, Py_ssize_t open_i, Py_ssize_t close_i);

// What is in the parentheses; the node itself when they are empty or belong to a part of it.
CNodeRef WithoutParentheses(CNodeRef node);

}  // namespace codeloom
