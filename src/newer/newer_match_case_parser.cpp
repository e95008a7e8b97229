#include "newer/newer_match_case_parser.h"

#include "host/restore.h"
#include "neighbours/token_type.h"
#include "parse/parentheses.h"
#include "parse/pseudo_node.h"
#include "parse/token_copy.h"
#include "tree/atom_nodes.h"
#include "tree/pattern_nodes.h"

namespace codeloom {

namespace {

constexpr Py_ssize_t kPatternIndex = 1;  // of the first token behind `case`

}  // namespace

CNodeRef CNewerMatchCaseParser::ParseMatchStmt(nb::tuple toks, nb::tuple positions) {
    const CRestoreOnExit<nb::object> line_toks(_fLineToks, toks);
    const CRestoreOnExit<nb::object> line_positions(_fLinePositions, positions);
    return CMatchCaseStatementParser::ParseMatchStmt(std::move(toks), std::move(positions));
}

CNodeRef CNewerMatchCaseParser::ParseCaseStmt(nb::tuple toks, nb::tuple positions) {
    const CRestoreOnExit<nb::object> line_toks(_fLineToks, toks);
    const CRestoreOnExit<nb::object> line_positions(_fLinePositions, positions);
    return CMatchCaseStatementParser::ParseCaseStmt(std::move(toks), std::move(positions));
}

CNodeRef CNewerMatchCaseParser::_ParseMatchStmtImpl() {
    if (_fLineToks.is_none()) return CMatchCaseStatementParser::_ParseMatchStmtImpl();
    return _MatchStmt([this] {
        return _Parse(
            InParentheses(nb::borrow<nb::tuple>(_fLineToks), _IndexInLine(0), _IndexInLine(_TokCount() - 1)));
    });
}

CNodeRef CNewerMatchCaseParser::_ParseCaseStmtImpl() {
    if (_fLineToks.is_none()) return CMatchCaseStatementParser::_ParseCaseStmtImpl();
    return _CaseStmt([this](Py_ssize_t start_i, Py_ssize_t end_i) {
        const nb::tuple toks = nb::borrow<nb::tuple>(_fLineToks);
        const Py_ssize_t count = TupleSize(toks);
        const Py_ssize_t end = end_i < _TokCount() ? _IndexInLine(end_i) : count;
        return _Parse(WithoutTokens(WithoutTokens(toks, 0, _IndexInLine(start_i)), end, count));
    });
}

CNodeRef CNewerMatchCaseParser::_NodeForPattern(Py_ssize_t start_i, Py_ssize_t end_i, bool allow_as) {
    // Of the ranges that begin here, the whole pattern is the only one with a comma outside brackets.
    if (start_i == kPatternIndex && allow_as && _Find(",", start_i, end_i) != -1)
        return _NodeForOpenSequence(start_i, end_i);
    const bool is_capture = allow_as && start_i + 2 < end_i && _IsTok(end_i - 2, "as");
    const bool is_single = !is_capture && _Find("|", start_i, end_i) == -1;
    if (is_single && start_i + 1 < end_i && _TokType(start_i) == kTokenId_STRING)
        return _NodeForStrings(start_i, end_i);
    if (start_i + 2 == end_i && _IsTok(start_i, "(") && _IsTok(start_i + 1, ")"))
        return _NodeForSequencePattern(start_i, end_i);
    return CMatchCaseStatementParser::_NodeForPattern(start_i, end_i, allow_as);
}

//   case a, *b:
//        ^^^^^
//   a CSequencePatternNode: the patterns with the commas, without brackets
CNodeRef CNewerMatchCaseParser::_NodeForOpenSequence(Py_ssize_t start_i, Py_ssize_t end_i) {
    CPatternWork work;
    {
        CPlan plan(work);
        _PlanPatterns(plan, start_i, end_i);
        plan.Build<CSequencePatternNode>();
    }
    return _Finish(work);
}

//   case "a" "b":
//        ^^^^^^^
//   a CAtom, as in an expression: a leaf for each string
CNodeRef CNewerMatchCaseParser::_NodeForStrings(Py_ssize_t start_i, Py_ssize_t end_i) {
    nb::list strings;
    for (Py_ssize_t i = start_i; i < end_i; ++i) {
        if (_TokType(i) != kTokenId_STRING) _FailAt(i);
        strings.append(_TokNode(i).Release());
    }
    return NewPseudoNode<CAtom>(std::move(strings));
}

// Where a token stands among those of the line, comments and backslashes included.
Py_ssize_t CNewerMatchCaseParser::_IndexInLine(Py_ssize_t tok_i) const {
    const nb::object position = _Position(tok_i);
    for (Py_ssize_t i = tok_i; i < TupleSize(_fLinePositions); ++i)
        if (position.is(TupleItem(_fLinePositions, i))) return i;
    return tok_i;
}

CNodeRef CNewerMatchCaseParser::_Parse(nb::tuple toks) {
    return _fPGenParser->_ParseToksToNodeImpl(std::move(toks), true, CPositions(_fLinePositions));
}

void BindNewerMatchCaseParser(nb::module_& module) {
    nb::class_<CNewerMatchCaseParser, CMatchCaseStatementParser,
               TMatchCaseParserOperations<CNewerMatchCaseParser>>
        binding(module, "CNewerMatchCaseParser", Collected<CNewerMatchCaseParser>(),
                "Parses match and case statements, open and empty sequences and adjacent strings included.");
    binding.def(TInit<CRef<CPGenParserImpl>>(), "pgen_parser"_a.none());
    BindOperations(binding);
}

}  // namespace codeloom
