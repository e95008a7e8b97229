// The comment side of CTypeHintWalker.
#include <algorithm>

#include "hints/type_hint_walker.h"
#include "host/errors.h"
#include "host/neighbour_call.h"
#include "host/restore.h"
#include "host/text.h"
#include "neighbours/imported_names.h"
#include "parse/syntax_error.h"
#include "symbolinfo/module_constants.h"
#include "text/token_type.h"
#include "tree/token_end.h"
#include "typing/function_hint.h"

namespace codeloom {

namespace {

constexpr CNeighbourFunction kGetLogicalsFromText("utils", "GetLogicalsFromText");

// Row or column of a token; a negative index counts from the end.
Py_ssize_t PlaceOf(CLogicalLine& logical, Py_ssize_t tok_i, int32_t CPosition::* native, Py_ssize_t item_i) {
    if (logical.Tokens() == nullptr) {
        const nb::tuple position(nb::borrow(TupleItem(logical.GetPositions(), tok_i)));
        return ResultFromHost<Py_ssize_t>(nb::borrow(TupleItem(position, item_i)));
    }
    if (tok_i < 0) tok_i += logical.fTokenCount;
    if (tok_i < 0 || tok_i >= logical.fTokenCount) RaiseIndexError("token index out of range");
    return logical.Tokens()[tok_i].position.*native;
}

Py_ssize_t RowOf(CLogicalLine& logical, Py_ssize_t tok_i) {
    return PlaceOf(logical, tok_i, &CPosition::row, 0);
}

Py_ssize_t ColumnOf(CLogicalLine& logical, Py_ssize_t tok_i) {
    return PlaceOf(logical, tok_i, &CPosition::col, 1);
}

bool IsComment(nb::handle tok) {
    return IsText(tok) && CUtf8(tok)->starts_with('#');
}

// The row on which a leaf starts: that of its token, or its own position. An invented token is where the
// last real one is.
Py_ssize_t StartRow(CLogicalLine& logical, const CNode& leaf) {
    if (nb::isinstance<nb::tuple>(leaf.fContext))
        return ResultFromHost<Py_ssize_t>(nb::borrow(TupleItem(leaf.fContext, 0)));
    const auto tok_i = ResultFromHost<Py_ssize_t>(leaf.fContext);
    return RowOf(logical, std::min<Py_ssize_t>(tok_i, logical.fTokenCount - 1));
}

Py_ssize_t RowCount(const CNode& leaf) {
    if (!IsText(leaf.fText)) RaiseWrongType("str", leaf.fText);
    if (CUtf8(leaf.fText)->find('\n') == std::string_view::npos) return 1;
    return static_cast<Py_ssize_t>(nb::len(leaf.fText.attr("splitlines")()));
}

CNode& LastPiece(const CArgument& arg) {
    return arg.value ? *arg.value : arg.type_expr ? *arg.type_expr : *arg.name;
}

// A hint is an expression. What stands for a statement is none: its node, or the leaf of a keyword such as
// `pass`.
bool IsHintExpression(const CNode& node) {
    if (node.As<CKeywordLiteral>() != nullptr) return IsKeywordLiteral(CUtf8(node.fText));
    const bool is_expression = node.As<CExpression>() != nullptr || !node.fText.is_none();
    return is_expression && node.As<CYieldExpr>() == nullptr;
}

// The arguments of a `def`, by the records which say that they are bound; none when it has no records.
nb::object NamesOfArguments(const CLogicalLine& funcdef_logical) {
    if (funcdef_logical.fArgTypeEquivs.IsEmpty()) return nb::none();
    nb::list names;
    funcdef_logical.fArgTypeEquivs.ForEach([&](nb::handle name, nb::handle equiv) {
        if (CUtf8(equiv)->starts_with(kSetPrefix)) names.append(name);
    });
    return names;
}

}  // namespace

// Finding

CTextOrNone CTypeHintWalker::_GetHintFromComment(nb::str comment) {
    return AlignedHintInComment(comment);
}

CFoundText CTypeHintWalker::_FindComment(Py_ssize_t row, CRef<CLogicalLine> logical) {
    if (!logical) logical = _fLogical;
    for (Py_ssize_t i = 0; i < logical->fTokenCount; ++i) {
        const Py_ssize_t tok_row = RowOf(*logical, i);
        if (tok_row > row) break;
        const nb::handle tok = TupleItem(logical->GetToks(), i);
        if (tok_row == row && IsComment(tok)) return {nb::borrow(tok), i};
    }
    return {};
}

CRowRange CTypeHintWalker::_GetRowRange(CNode& node) {
    const CNodeRef first = FirstLeaf(node), last = LastLeaf(node);
    return {StartRow(*_fLogical, *first), StartRow(*_fLogical, *last) + RowCount(*last)};
}

CFoundText CTypeHintWalker::_FindEndingTypeComment(CNode& node) {
    if (_fCommentHintCount == 0) return {};
    const CFoundText found = _FindComment(_GetRowRange(node).end_row - 1, nullptr);
    if (found.text.is_none()) return {};
    return {_GetHintFromComment(nb::borrow<nb::str>(found.text)), found.tok_i};
}

// Parsing

// A ParseError becomes a SyntaxError at `offset_of(context)`.
template <class Parse, class OffsetOf>
CNodeRef CTypeHintWalker::_Parsed(Py_ssize_t tok_i, Parse parse, OffsetOf offset_of) {
    nb::object context;
    try {
        return parse();
    } catch (const nb::python_error& error) {
        if (!IsParseError(error)) throw;
        context = nb::borrow(error.value()).attr("context");
    }
    _RaiseHintSyntaxError(tok_i, offset_of(ResultFromHost<Py_ssize_t>(context)));
    return CNodeRef();
}

CNodeRef CTypeHintWalker::_ParseHint(nb::str hint, Py_ssize_t tok_i, bool call_general_node_walker) {
    const nb::object logicals = kGetLogicalsFromText(hint);
    if (nb::len(logicals) != 1) return CNodeRef();
    const CRef<CLogicalLine> logical(Instance<CLogicalLine>(nb::object(logicals[0])));
    CNodeRef node = _Parsed(
        tok_i, [&] { return _fHintParser->ParseToNode(*logical, false); },
        [&](Py_ssize_t context) {  // an invented token stands for the last real one
            return ColumnOf(*logical, std::min<Py_ssize_t>(context, logical->fTokenCount - 1));
        });
    if (!node) return node;
    CNodeRef hint_node;
    TryFinally(
        [&] {
            if (!IsHintExpression(*node)) return;
            if (call_general_node_walker) _WalkNamesOf(node);
            hint_node = node;
        },
        [&] {
            if (!hint_node) _fHintParser->DiscardNode(node.AsHost());
        });
    return hint_node;
}

CRewrittenHint CTypeHintWalker::_RewriteFuncdefCommentHint(nb::str hint) {
    return RewriteFunctionHint(hint);
}

CNodeRef CTypeHintWalker::_ParseFuncdefCommentHint(nb::str hint, Py_ssize_t tok_i) {
    const CRewrittenHint rewritten = _RewriteFuncdefCommentHint(std::move(hint));
    return _Parsed(
        tok_i, [&] { return _fHintParser->ParseTokenListToNode(rewritten.toks, false); },
        [&](Py_ssize_t context) {
            const Py_ssize_t last_i = ListSize(rewritten.utf8_offsets) - 1;
            const nb::handle offset =
                ListItem(rewritten.utf8_offsets, std::max<Py_ssize_t>(0, std::min(last_i, context)));
            return ResultFromHost<Py_ssize_t>(nb::borrow(offset));
        });
}

void CTypeHintWalker::_RaiseHintSyntaxError(Py_ssize_t tok_i, Py_ssize_t utf8_offset_in_hint) {
    const nb::object position = HomeModule().attr("TextPosInfo")(0, -1, utf8_offset_in_hint);
    const nb::object error =
        CreateSyntaxError(nb::str("invalid syntax"), _fLogical.AsHost(), nb::int_(tok_i), position);
    RaiseHostError(error);
}

// The names that a hint uses are read by the line that it is on.
void CTypeHintWalker::_WalkNamesOf(const CNodeRef& hint_node) {
    if (_fGeneralNodeWalker) _fGeneralNodeWalker->Walk(hint_node, *_fLogical);
}

// Recording

void CTypeHintWalker::_ProcessTarget(CNode& node, CNodeRef target) {
    const CFoundText found = _FindEndingTypeComment(node);
    if (!found.text.is_none())
        _ProcessNameAndHint(target, nb::borrow<nb::str>(found.text), found.tok_i, false);
}

void CTypeHintWalker::_ProcessNameAndHint(const CNodeRef& name_node, const nb::str& hint, Py_ssize_t tok_i,
                                          bool is_arg) {
    const CNodeRef hint_node = _ParseHint(hint, tok_i, true);
    if (!hint_node) return;
    TryFinally([&] { _ProcessNameAndHintNodes(name_node, hint_node, is_arg); },
               [&] { _fHintParser->DiscardNode(hint_node.AsHost()); });
}

void CTypeHintWalker::_ProcessArgSpecificComment(const CArgument& arg) {
    if (!arg.name || _fCommentHintCount == 0) return;
    CLogicalLine& logical = *_fLogical;
    const Py_ssize_t count = Py_ssize_t{logical.fTokenCount};
    Py_ssize_t tok_i = GetTokenEndIndex(LastPiece(arg));
    if (tok_i < count && logical.GetTokenType(tok_i) == kTokenId_COMMA) ++tok_i;
    if (tok_i >= count || logical.GetTokenType(tok_i) != kTokenId_COMMENT) return;
    const nb::object tok = nb::borrow(TupleItem(logical.GetToks(), tok_i));
    if (!IsText(tok)) return;
    const nb::object hint = _GetHintFromComment(nb::borrow<nb::str>(tok));
    if (hint.is_none()) return;
    ++_fArgCommentCount;
    _ProcessNameAndHint(arg.name, nb::borrow<nb::str>(hint), tok_i, true);
}

// The comment after the header is a function's hint. Where arguments before have comments of their own, the
// last one has no room for its own but there: it owns a comment on its row that isn't in a function's form.
void CTypeHintWalker::_ProcessEndingComment(CFuncdefStmt& node, const CArgument* last_arg) {
    const CFoundText found = _FindEndingTypeComment(node);
    if (found.text.is_none()) return;
    const nb::str hint = nb::borrow<nb::str>(found.text);
    if (_fArgCommentCount != 0 && last_arg != nullptr && !HasFunctionForm(CUtf8(hint)) &&
        _GetRowRange(LastPiece(*last_arg)).end_row - 1 == RowOf(*_fLogical, found.tok_i)) {
        _ProcessNameAndHint(last_arg->name, hint, found.tok_i, true);
    } else {
        _ProcessFuncdefComment(hint, found.tok_i, _fLogical, true);
    }
}

void CTypeHintWalker::_ProcessFuncdefComment(nb::str hint, Py_ssize_t tok_i,
                                             CRef<CLogicalLine> funcdef_logical, bool is_arg) {
    const CNodeRef hint_node = _ParseFuncdefCommentHint(std::move(hint), tok_i);
    if (!hint_node) return;
    TryFinally(
        [&] {
            if (CFuncdefStmt* const funcdef = hint_node->As<CFuncdefStmt>())
                _RecordFuncdefHint(*funcdef, funcdef_logical.get(), is_arg);
        },
        [&] { _fHintParser->DiscardNode(hint_node.AsHost()); });
}

void CTypeHintWalker::_RecordFuncdefHint(CFuncdefStmt& hint_node, CLogicalLine* funcdef_logical,
                                         bool is_arg) {
    const nb::object arg_names = funcdef_logical == nullptr ? nb::list() : NamesOfArguments(*funcdef_logical);
    Py_ssize_t arg_i = -1;
    for (const CArgument& arg : GetDefiningArgInfoList(CNodeRef(hint_node.GetParameters().get()))) {
        if (arg.is_tuple) continue;
        ++arg_i;
        if (!arg.type_expr) continue;
        _WalkNamesOf(arg.type_expr);
        if (arg_names.is_none()) RaiseHost(PyExc_TypeError, "the def has no records of its arguments");
        const bool is_named = arg_i < ListSize(arg_names);
        _RecordHint(is_named ? nb::borrow(ListItem(arg_names, arg_i))
                             : nb::object(HomeModule().attr("BuildArgInfo")(arg_i, nb::none())),
                    arg.type_expr, is_arg);
    }
    const CNodeRef returned(hint_node.GetReturnType().get());
    if (!returned) return;
    _WalkNamesOf(returned);
    _RecordHint(nb::str(kReturnName), returned, is_arg);
}

}  // namespace codeloom
