// The part of CExtendedParser that reads what came with Python 3.15: the grammar takes the tokens around it.
#include <vector>

#include "extended/extended_parser.h"
#include "host/text.h"
#include "parse/token_copy.h"
#include "parse/token_search.h"

namespace codeloom {

bool CExtendedParser::_BeginsLazyImport(const nb::tuple& toks, Py_ssize_t lazy_i) {
    const Py_ssize_t next_i = _FindNextNonSkipIndex(toks, lazy_i);
    return IsToken(toks, next_i, "import") || IsToken(toks, next_i, "from");
}

//   [*a for a in b]    {**a for a in b}    lazy import b    if a: lazy import b    (PEP 798, PEP 810)
//    ^                  ^^                 ^^^^                   ^^^^             removed
nb::tuple CExtendedParser::_WithoutNewestForms(const nb::tuple& toks) {
    nb::tuple rest = toks;
    std::vector<Py_ssize_t> stars;  // by open bracket: what its first item begins with; -1 for none
    const auto take_off = [&](const CForm& form, Py_ssize_t i) {
        _fForms.Note(form, nb::int_(i));
        rest = WithoutTokens(rest, i, i + 1);
    };
    for (Py_ssize_t i = _FindNextNonSkipIndex(toks, -1); i < TupleSize(toks);
         i = _FindNextNonSkipIndex(toks, i)) {
        const CUtf8 text(TupleItem(toks, i));
        const int step = DepthStep(text);
        if (step > 0) {
            const Py_ssize_t next_i = _FindNextNonSkipIndex(toks, i);
            const bool is_starred =
                IsToken(toks, next_i, "*") || (text == "{" && IsToken(toks, next_i, "**"));
            stars.push_back(is_starred ? next_i : -1);
        } else if (stars.empty()) {
            if (text == "lazy" && _BeginsLazyImport(toks, i)) take_off(forms::kLazyImport, i);
        } else if (step < 0) {
            stars.pop_back();
        } else if (text == ",") {
            stars.back() = -1;
        } else if (text == "for" && stars.back() != -1) {
            take_off(forms::kUnpackingComprehension, stars.back());
            stars.back() = -1;
        }
    }
    return rest;
}

}  // namespace codeloom
