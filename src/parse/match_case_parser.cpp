#include "parse/match_case_parser.h"

#include "host/errors.h"
#include "host/neighbour_call.h"
#include "host/restore.h"
#include "host/text.h"
#include "neighbours/imported_names.h"
#include "parse/parentheses.h"
#include "parse/parser_driver.h"
#include "parse/pseudo_node.h"
#include "parse/token_copy.h"
#include "text/token_type.h"
#include "tree/statement_nodes.h"

namespace codeloom {

namespace {

constexpr CNeighbourFunction kFindMatchOrCaseType("logicalline", "FindMatchOrCaseType");
constexpr CNeighbourFunction kParseError("optpgen", "ParseError");

nb::object Row(const nb::tuple& positions, Py_ssize_t i) {
    return nb::handle(TupleItem(positions, i))[0];
}

// A comment, or a backslash that a later row follows.
bool IsSkipped(const nb::tuple& toks, const nb::tuple& positions, Py_ssize_t i) {
    const CUtf8 text(TupleItem(toks, i));
    if (text->empty()) RaiseIndexError("string index out of range");
    if (text->front() == '#') return true;
    if (text->front() != '\\' || i + 1 >= TupleSize(toks)) return false;
    return Row(positions, i) < Row(positions, i + 1);
}

// The tokens or positions of the line under way. Host code may have ended the parse meanwhile.
nb::tuple OfLine(const nb::object& tuple_or_none) {
    if (tuple_or_none.is_none()) RaiseHost(PyExc_TypeError, "no match or case statement is being parsed");
    return nb::borrow<nb::tuple>(tuple_or_none);
}

}  // namespace

CMatchCaseStatementParser::~CMatchCaseStatementParser() = default;

void CMatchCaseStatementParser::Init(CRef<CPGenParserImpl> pgen_parser) {
    _fPGenParser = std::move(pgen_parser);
    if (_fPGenParser) _fNodeFactory = _fPGenParser->_fNodeFactory;
}

Py_ssize_t CMatchCaseStatementParser::_NonNestedFindTokenIndex(nb::str tok, Py_ssize_t start,
                                                               Py_ssize_t end) {
    return start < end ? _fBracketSteps.Find(CUtf8(tok), OfLine(_fToks), start, end) : -1;
}

nb::tuple CMatchCaseStatementParser::_RemoveSkipToks(nb::tuple toks, nb::tuple positions) {
    nb::list kept_toks, kept_positions;
    for (Py_ssize_t i = 0; i < TupleSize(toks); ++i) {
        if (IsSkipped(toks, positions, i)) continue;
        kept_toks.append(TupleItem(toks, i));
        kept_positions.append(TupleItem(positions, i));
    }
    return nb::make_tuple(nb::tuple(kept_toks), nb::tuple(kept_positions));
}

CNodeRef CMatchCaseStatementParser::ParseMatchStmt(nb::tuple toks, nb::tuple positions) {
    const CCallOnExit forget([this] { _ForgetLine(); });
    _SetLine(_RemoveSkipToks(std::move(toks), std::move(positions)));
    return _ParseMatchStmtImpl();
}

CNodeRef CMatchCaseStatementParser::_ParseMatchStmtImpl() {
    return _MatchStmt([this] {
        const nb::tuple toks = OfLine(_fToks);
        return WithoutParentheses(_fPGenParser->_ParseToksToNodeImpl(
            InParentheses(toks, 0, TupleSize(toks) - 1), true, CPositions(_fPositions)));
    });
}

//   match a, b:
//         ^^^^    parsed as `(a, b)`
//   a CMatchStmt: `match`, the expression, `:`
CNodeRef CMatchCaseStatementParser::_MatchStmt(const std::function<CNodeRef()>& parse_subject) {
    if (!_IsStatementOfType(gLogicalTypes.kMatch)) return CNodeRef();
    const Py_ssize_t colon_i = _Find(":", 1, _TokCount());
    if (colon_i == -1) return CNodeRef();
    const CNodeRef subject = parse_subject();
    return NewPseudoNode<CMatchStmt>({_TokNode(0), subject, _TokNode(colon_i)});
}

CNodeRef CMatchCaseStatementParser::ParseCaseStmt(nb::tuple toks, nb::tuple positions) {
    const CCallOnExit forget([this] { _ForgetLine(); });
    _SetLine(_RemoveSkipToks(std::move(toks), std::move(positions)));
    return _ParseCaseStmtImpl();
}

CNodeRef CMatchCaseStatementParser::_ParseCaseStmtImpl() {
    return _CaseStmt([this](Py_ssize_t start_i, Py_ssize_t end_i) { return _ParseRange(start_i, end_i); });
}

//   case [a, b] if a > b: print(a)
//        ^^^^^^                       a pattern
//               ^^^^^^^^^             an `if` statement without a body
//                         ^^^^^^^^    a statement of its own
//   a CCaseStmt: `case`, the pattern, the guard if any, `:`, the body if any
CNodeRef CMatchCaseStatementParser::_CaseStmt(
    const std::function<CNodeRef(Py_ssize_t start_i, Py_ssize_t end_i)>& parse_range) {
    if (!_IsStatementOfType(gLogicalTypes.kCase)) return CNodeRef();
    const Py_ssize_t count = _TokCount();
    const Py_ssize_t colon_i = _FindCaseColon();
    if (colon_i == -1) return CNodeRef();
    const Py_ssize_t if_i = _Find("if", 1, colon_i);
    const CNodeRef pattern = _NodeForPattern(1, if_i == -1 ? colon_i : if_i);
    const CNodeRef guard = if_i == -1 ? CNodeRef() : parse_range(if_i, colon_i + 1);
    std::vector<CNodeRef> children = {_TokNode(0), pattern};
    if (guard) children.push_back(guard);
    children.push_back(_TokNode(colon_i));
    if (colon_i + 1 < count) children.push_back(parse_range(colon_i + 1, count));
    return NewPseudoNode<CCaseStmt>(children);
}

Py_ssize_t CMatchCaseStatementParser::_FindCaseColon() {
    return _Find(":", 1, _TokCount());
}

CNodeRef CMatchCaseStatementParser::_TokNode(Py_ssize_t tok_i) {
    const nb::object text = _Tok(tok_i);
    const nb::object position = _Position(tok_i);
    const int type = GetTokenType(CUtf8(text));
    if (type == kTokenId_NAME && FindInDict(_fPGenParser->_fKeywords, text).is_valid())
        return _fNodeFactory->NewKeywordNode(text, position);
    return _fNodeFactory->ConvertSingleNode(type, text, position, nb::none());
}

nb::object CMatchCaseStatementParser::_ParseExceptionAt(Py_ssize_t error_i) {
    return kParseError("Invalid syntax", 0, _Tok(error_i), _Position(error_i));
}

void CMatchCaseStatementParser::_SetLine(const nb::tuple& toks_and_positions) {
    if (TupleSize(toks_and_positions) != 2)
        RaiseHost(PyExc_ValueError, "expected a pair of tuples, of tokens and of positions");
    for (nb::handle items : toks_and_positions)
        if (!nb::isinstance<nb::tuple>(items)) RaiseWrongType("tuple", items);
    _fBracketSteps = CBracketSteps(TupleItem(toks_and_positions, 0));
    _fToks = nb::borrow(TupleItem(toks_and_positions, 0));
    _fPositions = nb::borrow(TupleItem(toks_and_positions, 1));
}

void CMatchCaseStatementParser::_ForgetLine() {
    _fToks = nb::none();
    _fPositions = nb::none();
}

bool CMatchCaseStatementParser::_IsStatementOfType(nb::handle logical_type) const {
    return kFindMatchOrCaseType(_fToks, 0, _TokCount()).equal(logical_type);
}

// A part of the line as a statement of its own; in its errors, tokens are counted from `start_i`.
CNodeRef CMatchCaseStatementParser::_ParseRange(Py_ssize_t start_i, Py_ssize_t end_i) {
    return _fPGenParser->_ParseToksToNodeImpl(ItemsBetween(_fToks, start_i, end_i), true,
                                              CPositions(ItemsBetween(_fPositions, start_i, end_i)));
}

Py_ssize_t CMatchCaseStatementParser::_TokCount() const {
    return TupleSize(OfLine(_fToks));
}

nb::object CMatchCaseStatementParser::_Tok(Py_ssize_t tok_i) const {
    return nb::borrow(TupleItem(OfLine(_fToks), tok_i));
}

nb::object CMatchCaseStatementParser::_Position(Py_ssize_t tok_i) const {
    return nb::borrow(TupleItem(OfLine(_fPositions), tok_i));
}

int CMatchCaseStatementParser::_TokType(Py_ssize_t tok_i) const {
    return GetTokenType(CUtf8(_Tok(tok_i)));
}

bool CMatchCaseStatementParser::_IsTok(Py_ssize_t tok_i, std::string_view text) const {
    return CUtf8(_Tok(tok_i)) == text;
}

Py_ssize_t CMatchCaseStatementParser::_Find(const char* tok, Py_ssize_t start_i, Py_ssize_t end_i) {
    return CheckedIndex(_NonNestedFindTokenIndex(nb::str(tok), start_i, end_i), start_i, end_i);
}

void CMatchCaseStatementParser::_FailAt(Py_ssize_t error_i) {
    RaiseHostError(_ParseExceptionAt(error_i));
}

void BindMatchCaseParser(nb::module_& module) {
    nb::class_<CMatchCaseStatementParser, THostSubclass<CMatchCaseStatementParser>> binding(
        module, "CMatchCaseStatementParser", Collected<CMatchCaseStatementParser>(),
        "Parses match and case statements by hand, since the grammar files don't know them.");
    binding.def(TInit<CRef<CPGenParserImpl>>(), "pgen_parser"_a.none());
    BindOperations(binding);
}

}  // namespace codeloom
