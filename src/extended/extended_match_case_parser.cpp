#include "extended/extended_match_case_parser.h"

#include "host/errors.h"
#include "host/restore.h"
#include "parse/parentheses.h"
#include "parse/pattern_tokens.h"
#include "parse/pseudo_node.h"
#include "parse/token_copy.h"
#include "text/token_type.h"
#include "tree/atom_nodes.h"
#include "tree/pattern_nodes.h"

namespace codeloom {

namespace {

constexpr Py_ssize_t kPatternIndex = 1;  // of the first token after `case`

// An expression that is valid without the invented parentheses: no comprehension, `yield` or lone star.
bool IsSubject(const CNode& node) {
    if (node.As<CStarExpression>() || node.As<CYieldExpr>() || node.HasText("yield")) return false;
    CTestListStarExpr* const list = node.As<CTestListStarExpr>();
    return list == nullptr || list->IsTuple();
}

}  // namespace

struct CExtendedMatchCaseParser::CPatternTokens : CMatchCaseStatementParser::CPatternTokens {
    static constexpr Py_ssize_t kFirstAfterWord = kPatternIndex;
    static constexpr CPatternNodeMaker kAtom = &NewPseudoNode<CAtom>;

    CExtendedMatchCaseParser& extended_parser;

    void RefuseKeyword(Py_ssize_t i) const { extended_parser._RefuseKeyword(i); }
};

// Removed tokens don't belong to the statement: those before the bound in `def f[T: match.a]()`.
nb::tuple CExtendedMatchCaseParser::_RemoveSkipToks(nb::tuple toks, nb::tuple positions) {
    nb::list kept_toks, kept_positions;
    for (Py_ssize_t i = 0; i < TupleSize(toks); ++i) {
        if (TupleItem(toks, i).is_none()) continue;
        kept_toks.append(TupleItem(toks, i));
        kept_positions.append(TupleItem(positions, i));
    }
    return CMatchCaseStatementParser::_RemoveSkipToks(nb::tuple(kept_toks), nb::tuple(kept_positions));
}

CNodeRef CExtendedMatchCaseParser::ParseMatchStmt(nb::tuple toks, nb::tuple positions) {
    const CRestoreOnExit<nb::object> line_toks(_fLineToks, toks);
    const CRestoreOnExit<nb::object> line_positions(_fLinePositions, positions);
    return CMatchCaseStatementParser::ParseMatchStmt(std::move(toks), std::move(positions));
}

CNodeRef CExtendedMatchCaseParser::ParseCaseStmt(nb::tuple toks, nb::tuple positions) {
    const CRestoreOnExit<nb::object> line_toks(_fLineToks, toks);
    const CRestoreOnExit<nb::object> line_positions(_fLinePositions, positions);
    return CMatchCaseStatementParser::ParseCaseStmt(std::move(toks), std::move(positions));
}

CNodeRef CExtendedMatchCaseParser::_ParseMatchStmtImpl() {
    if (_fLineToks.is_none()) return CMatchCaseStatementParser::_ParseMatchStmtImpl();
    return _MatchStmt([this] {
        CNodeRef node = _Parse(
            InParentheses(nb::borrow<nb::tuple>(_fLineToks), _IndexInLine(0), _IndexInLine(_TokCount() - 1)));
        const CNode* const subject = node ? node->TryChild<CNode>(1) : nullptr;
        if (subject && !IsSubject(*subject)) _FailAt(1);
        return WithoutParentheses(std::move(node));
    });
}

CNodeRef CExtendedMatchCaseParser::_ParseCaseStmtImpl() {
    if (_fLineToks.is_none()) return CMatchCaseStatementParser::_ParseCaseStmtImpl();
    return _CaseStmt([this](Py_ssize_t start_i, Py_ssize_t end_i) {
        const nb::tuple toks = nb::borrow<nb::tuple>(_fLineToks);
        const Py_ssize_t count = TupleSize(toks);
        const Py_ssize_t end = end_i < _TokCount() ? _IndexInLine(end_i) : count;
        return _Parse(WithoutTokens(WithoutTokens(toks, 0, _IndexInLine(start_i)), end, count));
    });
}

// `case x if lambda: 1:`, each lambda of a guard has a colon of its own.
Py_ssize_t CExtendedMatchCaseParser::_FindCaseColon() {
    int lambda_count = 0;
    Py_ssize_t start_i = kPatternIndex;
    for (;;) {
        const Py_ssize_t colon_i = _Find(":", start_i, _TokCount());
        if (colon_i == -1) return -1;
        for (Py_ssize_t i = _Find("lambda", start_i, colon_i); i != -1; i = _Find("lambda", i + 1, colon_i))
            ++lambda_count;
        if (lambda_count-- == 0) return colon_i;
        start_i = colon_i + 1;
    }
}

CNodeRef CExtendedMatchCaseParser::_NodeForPattern(Py_ssize_t start_i, Py_ssize_t end_i, bool allow_as) {
    const CRecursionScope recursion;  // for overrides, which call one another
    CPatternWork work;
    CExtendedMatchCaseParser::DoPatternStep(work, {CPatternStep::EKind::kPattern, start_i, end_i, allow_as});
    return _Finish(work);
}

void CExtendedMatchCaseParser::DoPatternStep(CPatternWork& work, const CPatternStep& step) {
    const bool is_pattern = step.kind == CPatternStep::EKind::kPattern;
    if (is_pattern && TCasePatternPlans(CPatternTokens{{*this}, *this}).PlanExtended(CPlan(work), step))
        return;
    if (step.kind == CPatternStep::EKind::kToken && !_IsTok(step.start_i, "as")) _RefuseKeyword(step.start_i);
    CMatchCaseStatementParser::DoPatternStep(work, step);
}

void CExtendedMatchCaseParser::_RefuseKeyword(Py_ssize_t tok_i) {
    const nb::object tok = _Tok(tok_i);
    if (_fPGenParser->IsKeyword(tok) && !TextIsOneOf(tok, "None", "True", "False")) _FailAt(tok_i);
}

// Where a token is among those of the line, comments and backslashes included.
Py_ssize_t CExtendedMatchCaseParser::_IndexInLine(Py_ssize_t tok_i) const {
    const nb::object position = _Position(tok_i);
    for (Py_ssize_t i = tok_i; i < TupleSize(_fLinePositions); ++i)
        if (position.is(TupleItem(_fLinePositions, i))) return i;
    return tok_i;
}

CNodeRef CExtendedMatchCaseParser::_Parse(nb::tuple toks) {
    return _fPGenParser->_ParseToksToNodeImpl(std::move(toks), true, CPositions(_fLinePositions));
}

void BindExtendedMatchCaseParser(nb::module_& module) {
    nb::class_<CExtendedMatchCaseParser, CMatchCaseStatementParser, THostSubclass<CExtendedMatchCaseParser>>
        binding(module, "CExtendedMatchCaseParser", Collected<CExtendedMatchCaseParser>(),
                "Parses match and case statements, open and empty sequences and adjacent strings included.");
    binding.def(TInit<CRef<CPGenParserImpl>>(), "pgen_parser"_a.none());
    BindOperations(binding);
}

}  // namespace codeloom
