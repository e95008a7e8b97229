// Statements beyond the grammar files: `match` and `case`, which have a parser of their own, `with` in
// parentheses, `except*`, type parameters. Of the latter three, the tokens in the way are removed from a copy
// of the tuple, and the rest is parsed by the grammar; the indexes of all other tokens stay.
#include "host/errors.h"
#include "host/text.h"
#include "neighbours/imported_names.h"
#include "parse/parser_driver.h"
#include "parse/pseudo_node.h"
#include "parse/token_copy.h"
#include "parse/token_search.h"
#include "tree/statement_nodes.h"

namespace codeloom {

namespace {

bool MayBeSpecialCase(nb::handle first_tok) {
    return TextIsOneOf(first_tok, "with", "match", "case", "except", "type", "def", "class", "async");
}

}  // namespace

CNodeRef CPGenParserImpl::_ParseSpecialCases(nb::tuple toks, bool in_async_def, CPositions positions) {
    const Py_ssize_t i = _FindNextNonSkipIndex(toks, -1);
    if (i >= TupleSize(toks)) return CNodeRef();
    if (!MayBeSpecialCase(TupleItem(toks, i))) return CNodeRef();
    const CUtf8 text(TupleItem(toks, i));
    if (text == "with") return _ParseSpecialCaseParenthesizedWith(toks, in_async_def, positions, i);
    if (text == "match")
        return _fMatchCaseStatementParser->ParseMatchStmt(toks, nb::tuple(positions.AsHost()));
    if (text == "case") return _fMatchCaseStatementParser->ParseCaseStmt(toks, nb::tuple(positions.AsHost()));
    if (text == "except") return _ParseSpecialCaseExceptStar(toks, in_async_def, positions, i);
    if (text == "type" || text == "def" || text == "class")
        return _ParseSpecialCaseWithTypeParameter(toks, in_async_def, positions, i);
    if (text != "async") return CNodeRef();
    const Py_ssize_t next_i = _FindNextNonSkipIndex(toks, i);
    if (!IsToken(toks, next_i, "def")) return CNodeRef();
    return _ParseSpecialCaseWithTypeParameter(toks, in_async_def, positions, next_i);
}

//   with (open(a) as f, open(b) as g):
//        ^                          ^   removed
CNodeRef CPGenParserImpl::_ParseSpecialCaseParenthesizedWith(nb::tuple toks, bool in_async_def,
                                                             CPositions positions, Py_ssize_t i) {
    const Py_ssize_t open_i = _FindNextNonSkipIndex(toks, i);
    if (!IsToken(toks, open_i, "(")) return CNodeRef();
    const Py_ssize_t close_i = _NonNestedFindTokenIndex(nb::str(")"), toks, open_i + 1, TupleSize(toks));
    if (close_i <= open_i || close_i >= TupleSize(toks)) return CNodeRef();
    const nb::tuple rest = WithoutTokens(WithoutTokens(toks, open_i, open_i + 1), close_i, close_i + 1);
    return _ParseToksToNodeImpl(rest, in_async_def, positions);
}

//   except* ValueError as e:
//         ^                    removed
CNodeRef CPGenParserImpl::_ParseSpecialCaseExceptStar(nb::tuple toks, bool in_async_def, CPositions positions,
                                                      Py_ssize_t i) {
    const Py_ssize_t star_i = _FindNextNonSkipIndex(toks, i);
    if (!IsToken(toks, star_i, "*")) return CNodeRef();
    const Py_ssize_t next_i = _FindNextNonSkipIndex(toks, star_i);
    if (next_i >= TupleSize(toks) || IsToken(toks, next_i, ":")) return CNodeRef();
    return _ParseToksToNodeImpl(WithoutTokens(toks, star_i, star_i + 1), in_async_def, positions);
}

//   def f[T: int, *Ts](x):    type X[T] = list[T]
//        ^^^^^^^^^^^^^          ^^^^  ^^^            removed
CNodeRef CPGenParserImpl::_ParseSpecialCaseWithTypeParameter(nb::tuple toks, bool in_async_def,
                                                             CPositions positions, Py_ssize_t i) {
    const Py_ssize_t count = TupleSize(toks);
    const Py_ssize_t name_i = _FindNextNonSkipIndex(toks, i);
    if (name_i >= count || !IsName(toks, name_i)) return CNodeRef();
    const Py_ssize_t next_i = _FindNextNonSkipIndex(toks, name_i);
    if (next_i < 0 || next_i >= count) return CNodeRef();
    const bool is_type = IsToken(toks, i, "type"), has_parameters = IsToken(toks, next_i, "[");
    if (!is_type && !has_parameters) return CNodeRef();

    nb::list parameters;
    nb::tuple rest = toks;
    if (has_parameters) {
        const Py_ssize_t close_i = _NonNestedFindTokenIndex(nb::str("]"), toks, next_i + 1, count);
        if (close_i < 0 || close_i >= count) _RaiseParseError(nb::int_(next_i));
        parameters = _NodesForTypeParameters(toks, in_async_def, positions, next_i, close_i, true);
        rest = WithoutTokens(rest, next_i, close_i + 1);
    }
    if (is_type) rest = WithoutTokens(rest, i, i + 1);
    CNodeRef node = _ParseToksToNodeImpl(rest, in_async_def, positions);
    if (!has_parameters) return node;
    parameters.append(node.Release());
    return NewPseudoNode<CWithTypeParameters>(std::move(parameters));
}

nb::list CPGenParserImpl::_NodesForTypeParameters(nb::tuple toks, bool in_async_def, CPositions positions,
                                                  Py_ssize_t start, Py_ssize_t end, bool raise_errors) {
    nb::list nodes;
    for (Py_ssize_t i = start + 1; i < end;) {
        Py_ssize_t comma = CheckedIndex(_NonNestedFindTokenIndex(nb::str(","), toks, i, end), i, end);
        if (comma == -1) comma = end;
        const Py_ssize_t name_i = _FindNextNonSkipIndex(toks, i - 1);  // a comment may be before it
        CNodeRef node =
            _CreateSingleTypeParameterNode(toks, in_async_def, positions, name_i, comma, raise_errors);
        if (node) nodes.append(node.Release());
        i = comma + 1;
    }
    return nodes;
}

//   T        *Ts        T: int
CNodeRef CPGenParserImpl::_CreateSingleTypeParameterNode(nb::tuple toks, bool in_async_def,
                                                         CPositions positions, Py_ssize_t start,
                                                         Py_ssize_t end, bool raise_errors) {
    if (start >= end) return CNodeRef();
    const auto refuse = [&](Py_ssize_t tok_i) {
        if (raise_errors) _RaiseParseError(nb::int_(tok_i));
        return CNodeRef();
    };
    nb::list children;
    Py_ssize_t name_i = start;
    if (IsToken(toks, start, "*") || IsToken(toks, start, "**")) {
        children.append(_fNodeFactory->CreateOperatorNode(TupleItem(toks, start), nb::int_(start)).Release());
        name_i = _FindNextNonSkipIndex(toks, start);
    }
    if (!IsName(toks, name_i)) return refuse(start);

    const Py_ssize_t next_i = _FindNextNonSkipIndex(toks, name_i);
    const bool has_bound = next_i < end;
    if (has_bound && (!IsToken(toks, next_i, ":") || next_i + 1 >= end)) return refuse(next_i);
    CNodeRef colon_node, bound;
    if (has_bound) {
        colon_node = _fNodeFactory->CreateOperatorNode(TupleItem(toks, next_i), nb::int_(next_i));
        bound = _ParseBound(toks, in_async_def, positions, next_i, end, raise_errors);
    }
    children.append(_fNodeFactory->NewNameNode(TupleItem(toks, name_i), nb::int_(name_i)).Release());
    if (bound) {
        children.append(colon_node.Release());
        children.append(bound.Release());
    }
    return NewPseudoNode<CTypeParameter>(std::move(children));
}

CNodeRef CPGenParserImpl::_ParseBound(const nb::tuple& toks, bool in_async_def, const CPositions& positions,
                                      Py_ssize_t mark_i, Py_ssize_t end, bool raise_errors) {
    try {
        return ParsePart(toks, in_async_def, positions, mark_i + 1, end);
    } catch (const nb::python_error& error) {
        if (raise_errors || !IsParseError(error)) throw;
        return CNodeRef();
    }
}

// Without a copy, unless hand-written parsers or a failure need one: a line may hold many bounds.
CNodeRef CPGenParserImpl::ParsePart(const nb::tuple& toks, bool in_async_def, const CPositions& positions,
                                    Py_ssize_t start, Py_ssize_t end) {
    const Py_ssize_t i = _FindNextNonSkipIndex(toks, start - 1);
    if (positions.IsNone() || (i < end && MayBeSpecialCase(TupleItem(toks, i))))
        return _ParseCopyOfPart(toks, in_async_def, positions, start, end);
    return _ParseByGrammar(toks, in_async_def, positions, start, end);
}

CNodeRef CPGenParserImpl::_ParseCopyOfPart(const nb::tuple& toks, bool in_async_def,
                                           const CPositions& positions, Py_ssize_t start, Py_ssize_t end) {
    const nb::tuple part = WithoutTokens(ItemsBetween(toks, 0, end), 0, start);
    return ParseToksToNode(part, in_async_def, CPositions(ItemsBetween(positions.AsHost(), 0, end)));
}

nb::list CPGenParserImpl::GetTypeParameterNodes(nb::tuple toks) {
    const Py_ssize_t count = TupleSize(toks);
    Py_ssize_t i = _FindNextNonSkipIndex(toks, -1);
    if (IsToken(toks, i, "async")) i = _FindNextNonSkipIndex(toks, i);
    if (!IsToken(toks, i, "type") && !IsToken(toks, i, "class") && !IsToken(toks, i, "def"))
        return nb::list();
    const Py_ssize_t name_i = _FindNextNonSkipIndex(toks, i);
    if (name_i >= count || !IsName(toks, name_i)) return nb::list();
    const Py_ssize_t open_i = _FindNextNonSkipIndex(toks, name_i);
    if (!IsToken(toks, open_i, "[")) return nb::list();
    const Py_ssize_t close_i = _NonNestedFindTokenIndex(nb::str("]"), toks, open_i + 1, count);
    if (close_i < 0 || close_i >= count) _RaiseParseError(nb::int_(open_i));
    return _NodesForTypeParameters(toks, false, CPositions(), open_i, close_i, false);
}

}  // namespace codeloom
