// Searches among the tokens of a logical line.
#pragma once

#include <string_view>

#include "host/collections.h"
#include "host/text.h"

namespace codeloom {

// The index in [start, end) of the token `target` outside brackets; -1 when there is none. The target may be
// a bracket itself. Kinds of brackets aren't told apart, and the depth may fall below zero, where nothing is
// found.
inline Py_ssize_t FindOutsideBrackets(std::string_view target, nb::handle toks, Py_ssize_t start,
                                      Py_ssize_t end) {
    int depth = 0;
    for (Py_ssize_t i = start; i < end; ++i) {
        const CUtf8 utf8(TupleItem(toks, i));
        const std::string_view text = utf8;
        if (depth == 0 && target == text) return i;
        if (text.size() != 1) continue;
        if (text[0] == '(' || text[0] == '[' || text[0] == '{') ++depth;
        if (text[0] == ')' || text[0] == ']' || text[0] == '}') --depth;
    }
    return -1;
}

}  // namespace codeloom
