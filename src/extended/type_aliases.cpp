// The part of CExtendedParser that distinguishes `type` the keyword from `type` the name.
#include "extended/extended_parser.h"
#include "extended/outside_brackets.h"
#include "host/errors.h"
#include "host/text.h"
#include "neighbours/imported_names.h"
#include "parse/token_copy.h"
#include "parse/token_search.h"
#include "tokenizer/keywords.h"
#include "tree/child_list.h"
#include "tree/statement_nodes.h"

namespace codeloom {

namespace {

// Calls visit(start, end) for each statement on a row: for those of the body after a header, or for all.
// The first token of the row is at `first_i`.
template <class Visit>
void ForEachStatement(const nb::tuple& toks, Py_ssize_t first_i, Visit visit) {
    const Py_ssize_t count = TupleSize(toks);
    bool has_header = first_i < count && IsCompoundWord(WordOf(CUtf8(TupleItem(toks, first_i))));
    Py_ssize_t start = has_header ? -1 : first_i;
    ForEachOutsideBrackets(toks, first_i, count, [&](Py_ssize_t i, std::string_view text) {
        const bool ends_header = has_header && text == ":";
        if (text == ";" && start != -1) visit(start, i);
        if (text == ";" || ends_header) start = i + 1;
        if (ends_header) has_header = false;
        return true;
    });
    if (start != -1) visit(start, count);
}

// True when the last token before `i`, but for comments, backslashes and removed ones, is `word`.
bool IsBehind(std::string_view word, const nb::tuple& toks, Py_ssize_t i) {
    while (--i >= 0 && i < TupleSize(toks)) {
        const nb::handle tok = TupleItem(toks, i);
        if (tok.is_none()) continue;
        const CUtf8 text(tok);
        if (!IsPassedOver(text)) return text == word;
    }
    return false;
}

}  // namespace

// `type` is a name like any other, unless it begins an alias.
CNodeRef CExtendedParser::_ParseSpecialCaseWithTypeParameter(nb::tuple toks, bool in_async_def,
                                                             CPositions positions, Py_ssize_t i) {
    const bool is_type = IsToken(toks, i, "type");
    if (is_type && !_BeginsTypeAlias(toks, i)) return CNodeRef();
    CNodeRef node = CPGenParserImpl::_ParseSpecialCaseWithTypeParameter(toks, in_async_def, positions, i);
    if (!node) return node;
    if (is_type) _RequireAlias(*node);
    const Py_ssize_t after_name_i = _FindNextNonSkipIndex(toks, _FindNextNonSkipIndex(toks, i));
    _fForms.Note(is_type ? forms::kTypeAlias : forms::kTypeParameters, nb::int_(is_type ? i : after_name_i));
    return node;
}

//   type X = int    type X[T] = list[T]
//          ^                  ^             distinguishes it from `type`, the name
bool CExtendedParser::_BeginsTypeAlias(const nb::tuple& toks, Py_ssize_t type_i) {
    const Py_ssize_t name_i = _FindNextNonSkipIndex(toks, type_i);
    if (!_IsPlainName(toks, name_i)) return false;
    Py_ssize_t i = _FindNextNonSkipIndex(toks, name_i);
    if (IsToken(toks, i, "[")) {
        i = _NonNestedFindTokenIndex(nb::str("]"), toks, i + 1, TupleSize(toks));
        if (i == -1) return true;  // the bracket is what is wrong
        i = _FindNextNonSkipIndex(toks, i);
    }
    return IsToken(toks, i, "=");
}

// The assignment that an alias is parsed as has one `=`, and one expression after it.
void CExtendedParser::_RequireAlias(const CNode& node) {
    const CNode& assignment = node.As<CWithTypeParameters>() ? node.ChildAt(-1) : node;
    if (ListedCount(assignment) > 3) _RaiseParseError(assignment.ChildAt(3).fContext);
    _RequireSingle(assignment.ChildAt(2));
}

// In a body after its header the grammar doesn't know an alias, and stumbles over its name. What is newer
// than the grammar it stumbles over anywhere.
CNodeRef CExtendedParser::_ParseToksToNodeImpl(nb::tuple toks, bool in_async_def, CPositions positions) {
    nb::tuple rest = toks;
    try {
        return CPGenParserImpl::_ParseToksToNodeImpl(toks, in_async_def, positions);
    } catch (const nb::python_error& error) {
        if (!IsParseError(error)) throw;
        const nb::object context = error.value().attr("context");
        Py_ssize_t i = -1;
        if (!nb::try_cast(context, i)) throw;
        const bool may_be_newest =
            IsToken(toks, i, "for") || IsToken(toks, i, "async") || IsBehind("lazy", toks, i);
        if (may_be_newest) rest = _WithoutNewestForms(toks);
        if (rest.is(toks) && !IsBehind("type", toks, i)) throw;
    }
    if (rest.is(toks)) rest = _WithoutAliases(toks, in_async_def, positions);
    return CPGenParserImpl::_ParseToksToNodeImpl(rest, in_async_def, std::move(positions));
}

//   if a: type X = int; type Y[T] = list[T]
//         ^^^^          ^^^^  ^^^             removed, once each alias has been parsed by itself
nb::tuple CExtendedParser::_WithoutAliases(const nb::tuple& toks, bool in_async_def,
                                           const CPositions& positions) {
    const Py_ssize_t count = TupleSize(toks);
    nb::tuple rest = toks;
    ForEachStatement(toks, _FindNextNonSkipIndex(toks, -1), [&](Py_ssize_t start, Py_ssize_t end) {
        const Py_ssize_t type_i = _FindNextNonSkipIndex(toks, start - 1);
        if (!IsToken(toks, type_i, "type") || !_BeginsTypeAlias(toks, type_i)) return;
        const nb::tuple alone = WithoutTokens(WithoutTokens(toks, 0, type_i), end, count);
        const CNodeRef alias = _ParseSpecialCaseWithTypeParameter(alone, in_async_def, positions, type_i);
        if (alias) DiscardNode(alias.AsHost());
        const Py_ssize_t name_i = _FindNextNonSkipIndex(toks, type_i);
        const Py_ssize_t equal_i = _NonNestedFindTokenIndex(nb::str("="), toks, name_i, end);
        rest = WithoutTokens(WithoutTokens(rest, type_i, name_i), name_i + 1, equal_i);
    });
    return rest;
}

}  // namespace codeloom
