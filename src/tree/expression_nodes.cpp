#include "tree/expression_nodes.h"

#include "host/errors.h"
#include "tree/atom_nodes.h"

namespace codeloom {

// CExpression

CExpressionRef CExpression::GetSubExpr(int) {
    return CExpressionRef();
}

int CExpression::GetSubExprCount() {
    return 0;
}

// COperatorExpression

CTextOrNone COperatorExpression::GetOperatorStr(int operator_i) {
    const bool is_prefix = GetTermCount() == 1;
    if (operator_i < 0 || (is_prefix && operator_i != 0)) return CTextOrNone();
    const Py_ssize_t child_i = is_prefix ? 0 : Py_ssize_t{operator_i} * 2 + 1;
    if (child_i >= fChildren.Size()) return CTextOrNone();
    const CNode& node = ChildAt(child_i);
    return node.fText.is_none() ? _TextOfTwoWords(ChildAs<CNode>(child_i)) : CTextOrNone(node.fText);
}

// `not in`, `is not`
CTextOrNone COperatorExpression::_TextOfTwoWords(const CNodeRef& node) {
    if (node->ChildCount() != 2) return CTextOrNone();
    const nb::object first = node->ChildText(0), second = node->ChildText(1);
    if (first.is_none() || second.is_none()) return CTextOrNone();
    return first + nb::str(" ") + second;
}

int COperatorExpression::GetTermCount() {
    const Py_ssize_t child_count = ChildCount();
    if (child_count < 2) return 0;
    return child_count == 2 ? 1 : static_cast<int>(child_count / 2 + 1);
}

CNodeRef COperatorExpression::GetTerm(int term_index) {
    return GetTermCount() == 1 ? ChildAs<CNode>(1) : GetChild(Py_ssize_t{term_index} * 2);
}

// CStarExpression

CExpressionRef CStarExpression::GetStarredExpression() {
    return ChildAs<CExpression>(kExpressionIndex);
}

// CLambdaExpr

CNodeRef CLambdaExpr::GetArgumentsNode() {
    return IsToken(kArgumentsIndex, ":") ? CNodeRef() : ChildAs<CNode>(kArgumentsIndex);
}

CNodeRef CLambdaExpr::GetBodyExpr() {
    return ChildAs<CNode>(-1);
}

// CYieldExpr, CYieldArg

CNodeRef CYieldExpr::GetValue() {
    if (fChildren.Size() < 2) return CNodeRef();
    const CRef<CYieldArg> argument(TryChild<CYieldArg>(kArgumentIndex));
    return argument ? argument->GetValue() : ChildAs<CNode>(kArgumentIndex);
}

bool CYieldExpr::IsYieldFrom() {
    const CRef<CYieldArg> argument(TryChild<CYieldArg>(kArgumentIndex));
    return argument && argument->IsYieldFrom();
}

CNodeRef CYieldArg::GetValue() {
    return ChildAs<CNode>(ChildCount() < 2 ? 0 : 1);
}

bool CYieldArg::IsYieldFrom() {
    if (ChildCount() < 2) return false;
    const CKeywordLiteral* const keyword = TryChild<CKeywordLiteral>(0);
    return keyword != nullptr && keyword->HasText("from");
}

// CTestListStarExpr

CExpressionRef CTestListStarExpr::GetSubExpr(int i) {
    if (IsGenExpr()) return CExpressionRef();
    const Py_ssize_t child_i = Py_ssize_t{i} * 2;
    if (child_i >= fChildren.Size()) throw nb::value_error("Not enough expressions in list");
    if (CExpression* const expression = TryChild<CExpression>(child_i)) return CExpressionRef(expression);
    const nb::object message = nb::str("Elenment {} of {} needs to be a CExpression; fChildren = {}")
                                   .format(child_i, nb::repr(Self()), nb::repr(fChildren.AsHost()));
    RaiseHost(PyExc_ValueError, nb::borrow<nb::str>(message).c_str());
}

int CTestListStarExpr::GetSubExprCount() {
    return IsGenExpr() ? 1 : static_cast<int>((ChildCount() + 1) / 2);
}

bool CTestListStarExpr::IsTuple() {
    return !IsGenExpr() && HasToken(",");
}

bool CTestListStarExpr::IsGenExpr() {
    return ChildCount() >= 2 && TryChild<CCompForNode>(1) != nullptr;
}

// CAtomExpr

CNodeRef CAtomExpr::GetPrefix() {
    if (ChildCount() < 2) return CNodeRef();
    CKeywordLiteral* const keyword = TryChild<CKeywordLiteral>(0);
    const bool is_prefix =
        keyword != nullptr && keyword->HasText("await") && TryChild<CTrailer>(1) == nullptr;
    return is_prefix ? CNodeRef(keyword) : CNodeRef();
}

CNodeRef CAtomExpr::GetAtom() {
    return fChildren.IsNone() ? CNodeRef() : ChildAs<CNode>(_AtomIndex());
}

CNodeRange CAtomExpr::GetTrailers() {
    if (fChildren.IsNone()) return CNodeRange();
    const Py_ssize_t atom_i = _AtomIndex();
    return CNodeRange(*this, atom_i + 1, fChildren.Size());
}

Py_ssize_t CAtomExpr::_AtomIndex() {
    return GetPrefix() ? 1 : 0;
}

// CPower

CNodeRef CPower::GetAtom() {
    const CRef<CAtomExpr> atom_expr(ChildAt(0).As<CAtomExpr>());
    return atom_expr ? atom_expr->GetAtom() : ChildAs<CNode>(0);
}

CNodeRange CPower::GetTrailers() {
    const CRef<CAtomExpr> atom_expr(ChildAt(0).As<CAtomExpr>());
    if (atom_expr) return atom_expr->GetTrailers();
    Py_ssize_t end = 1;
    while (end < fChildren.Size() && !ChildAt(end).HasText("**")) ++end;
    return CNodeRange(*this, 1, end);
}

CNodeRef CPower::GetExponentNode() {
    return HasToken("**") ? ChildAs<CNode>(-1) : CNodeRef();
}

// CFactorExpr

CTextOrNone CFactorExpr::GetUnaryOperator() {
    const nb::object text = ChildText(0);
    return TextIsOneOf(text, "+", "-", "~") ? CTextOrNone(text) : CTextOrNone();
}

// CNamedExpr

CNodeRef CNamedExpr::GetAssignedName() {
    return ChildAs<CNode>(kNameIndex);
}

CNodeRef CNamedExpr::GetRightHandExpression() {
    return ChildAs<CNode>(kExpressionIndex);
}

// CCompForNode

bool CCompForNode::IsAsync() {
    return IsToken(0, "async");
}

CNodeRef CCompForNode::GetTargetNode() {
    return _Read(kTargetIndex, &CCompForNode::GetTargetNode);
}

CNodeRef CCompForNode::GetInNode() {
    return _Read(kIterableIndex, &CCompForNode::GetInNode);
}

CNodeRef CCompForNode::GetCompIterNode() {
    const bool may_have_next = _IsWrapped() || ChildCount() == _IndexInClause(kNextIndex) + 1;
    return may_have_next ? _Read(kNextIndex, &CCompForNode::GetCompIterNode) : CNodeRef();
}

// `async` and a whole clause, instead of `async` and the parts of one
bool CCompForNode::_IsWrapped() {
    return IsAsync() && ChildCount() == 2 && TryChild<CCompForNode>(kWrappedIndex) != nullptr;
}

Py_ssize_t CCompForNode::_IndexInClause(Py_ssize_t i) {
    return IsAsync() ? i + 1 : i;
}

// The child at `i` of the clause, or what `accessor` gives for a wrapped one.
CNodeRef CCompForNode::_Read(Py_ssize_t i, CNodeRef (CCompForNode::*accessor)()) {
    if (!_IsWrapped()) return ChildAs<CNode>(_IndexInClause(i));
    const CRecursionScope recursion;
    const CRef<CCompForNode> clause = ChildAs<CCompForNode>(kWrappedIndex);
    return ((*clause).*accessor)();
}

// CListmakerNode

int CListmakerNode::GetSubExprCount() {
    return _IsComprehension() ? 1 : static_cast<int>((ChildCount() - 1) / 2 + 1);
}

CExpressionRef CListmakerNode::GetSubExpr(nb::object i) {
    if (_IsComprehension()) return CExpressionRef();
    const nb::object child_i = i * nb::int_(2);
    return CExpressionRef::FromHost(GetChild(ResultFromHost<Py_ssize_t>(child_i)).AsHost());
}

bool CListmakerNode::_IsComprehension() {
    return ChildAt(1).As<CCompForNode>() != nullptr;
}

// CTrailer

CTextOrNone CTrailer::GetDotName() {
    const bool has_dot = ChildCount() == 2 && TryChild<CNode>(0) != nullptr && IsToken(0, ".");
    if (!has_dot) return CTextOrNone();
    const CNameLiteral* const name = TryChild<CNameLiteral>(kNameIndex);
    return name == nullptr ? CTextOrNone() : CTextOrNone(name->fText);
}

CNodeRef CTrailer::GetNestedNode() {
    const bool has_contents = ChildCount() == 3 && (IsToken(0, "[") || IsToken(0, "("));
    return has_contents ? ChildAs<CNode>(kContentsIndex) : CNodeRef();
}

CTextOrNone CTrailer::GetInitialToken() {
    if (ChildCount() == 0) throw nb::value_error("Trailer node with no children");
    return ChildAt(0).fText;
}

}  // namespace codeloom
