#include "parse/token_search.h"

#include "host/collections.h"
#include "host/text.h"
#include "text/token_type.h"

namespace codeloom {

int DepthStep(std::string_view token) {
    if (token.size() != 1) return 0;
    switch (token[0]) {
        case '(':
        case '[':
        case '{':
            return 1;
        case ')':
        case ']':
        case '}':
            return -1;
        default:
            return 0;
    }
}

bool IsToken(nb::handle toks, Py_ssize_t i, std::string_view text) {
    return i < TupleSize(toks) && CUtf8(TupleItem(toks, i)) == text;
}

bool IsName(nb::handle toks, Py_ssize_t i) {
    return GetTokenType(CUtf8(TupleItem(toks, i))) == kTokenId_NAME;
}

Py_ssize_t FindOutsideBrackets(std::string_view target, nb::handle toks, Py_ssize_t start, Py_ssize_t end,
                               int depth) {
    for (Py_ssize_t i = start; i < end; ++i) {
        const CUtf8 token(TupleItem(toks, i));
        if (depth == 0 && token == target) return i;
        depth += DepthStep(token);
    }
    return -1;
}

Py_ssize_t CheckedIndex(Py_ssize_t found, Py_ssize_t start, Py_ssize_t end) {
    if (found == -1 || (start <= found && found < end)) return found;
    PyErr_Format(PyExc_ValueError,
                 "_NonNestedFindTokenIndex must return -1 or an index in [%zd, %zd), not %zd", start, end,
                 found);
    throw nb::python_error();
}

CBracketSteps::CBracketSteps(nb::handle toks) {
    const Py_ssize_t count = TupleSize(toks);
    _fNext.resize(static_cast<size_t>(count), count);
    std::vector<size_t> open;
    for (Py_ssize_t i = 0; i < count; ++i) {
        const int step = DepthStep(CUtf8(TupleItem(toks, i)));
        if (step < 0 && !open.empty()) {
            _fNext[open.back()] = i + 1;
            open.pop_back();
        }
        if (step > 0) open.push_back(static_cast<size_t>(i));
        if (step <= 0) _fNext[static_cast<size_t>(i)] = i + 1;
    }
}

Py_ssize_t CBracketSteps::Find(std::string_view target, nb::handle toks, Py_ssize_t start,
                               Py_ssize_t end) const {
    if (start < 0) return FindOutsideBrackets(target, toks, start, end);
    for (Py_ssize_t i = start; i < end; i = _fNext[static_cast<size_t>(i)]) {
        const CUtf8 token(TupleItem(toks, i));
        if (token == target) return i;
        if (DepthStep(token) < 0) return FindOutsideBrackets(target, toks, i + 1, end, -1);
    }
    return -1;
}

}  // namespace codeloom
