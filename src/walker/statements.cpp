// Statements and expressions that bind names by a target, and those that hand a value on.
#include "host/errors.h"
#include "host/text.h"
#include "neighbours/imported_names.h"
#include "parse/syntax_error.h"
#include "strutils/text.h"
#include "symbolinfo/vocabulary.h"
#include "walker/node_walker.h"

namespace codeloom {

void CNodeWalker::_VisitForStmt(CForStmt& node) {
    const CNodeRef target = node.GetTarget(), iterable = node.GetInExpression();
    _VisitStoreContextNode(*target);
    _VisitNode(*iterable);
    _ProcessTargets(*target, iterable, CBytesOrNone(JoinUtf8({kIterationSubscript})));
    _VisitNode(*node.GetBody());
    if (const CNodeRef else_body = node.GetElseBody()) _VisitNode(*else_body);
}

// The target isn't visited: what one like `x[i]` reads isn't recorded.
void CNodeWalker::_VisitWithItem(CWithItem& node) {
    const CNodeRef expression = node.GetExpression(), target = node.GetTarget();
    _ProcessTargets(*target, expression);
    _VisitNode(*expression);
}

void CNodeWalker::_VisitExceptClause(CExceptClause& exc_clause) {
    const CNodeRef target = exc_clause.GetTarget(), type = exc_clause.GetExceptionType();
    if (!type) return;
    _VisitNode(*type);
    if (!target) return;
    if (target->As<CNameLiteral>() == nullptr)
        RaiseHostError(CreateSyntaxError(nb::str("Name in except clause must be a simple name"),
                                         _fLogical.AsHost(), target->fContext, nb::none()));
    _ProcessTargets(*target, CNodeRef());
    for (const nb::object& instance_name : _InstanceNamesFor(*type)) _AddNodeInfoStr(*target, instance_name);
}

void CNodeWalker::_VisitReturn(CReturnStmt& return_stmt) {
    const CNodeRef value = return_stmt.GetValue();
    if (!value) return;
    _VisitNode(*value);
    const CBytesOrNone equiv = _TypeEquivForNode(*value);
    static const CHostText kReturn("return");
    if (!equiv.is_none()) _AddTypeEquiv(nb::handle(kReturn), equiv);
}

// Unlike a `return`, a `yield` of an unknown value is recorded, as an empty equiv.
void CNodeWalker::_VisitYield(CYieldExpr& yield_expr) {
    const CNodeRef value = yield_expr.GetValue();
    if (!value) return;
    _VisitNode(*value);
    const CBytesOrNone equiv = _TypeEquivForNode(*value);
    const nb::bytes from(yield_expr.IsYieldFrom() ? "from " : "");
    static const CHostText kYield("yield");
    _AddTypeEquiv(nb::handle(kYield), Utf8Concat2(from, equiv));
}

void CNodeWalker::_VisitNamedExpr(CNode& node) {
    CNodeRef name, value;
    if (CNamedExpr* const expression = node.As<CNamedExpr>()) {
        name = expression->GetAssignedName();
        value = expression->GetRightHandExpression();
    } else if (CSingleUsedArgumentNode* const argument = node.As<CSingleUsedArgumentNode>()) {
        name = argument->GetNameAssigned();
        value = argument->GetNamedRightHandExpression();
    } else {
        RaiseHost(PyExc_AssertionError, node.Self());
    }
    _ProcessTargets(*name, value);
    _VisitNode(*value);
}

void CNodeWalker::_VisitMatchStmt(CMatchStmt& match_stmt) {
    if (const CExpressionRef subject = match_stmt.GetTestExpression()) _VisitNode(*subject);
}

void CNodeWalker::_VisitCaseStmt(CCaseStmt& case_stmt) {
    const CNodeRef pattern = case_stmt.GetPattern();
    if (CPatternNode* const pattern_node = pattern ? pattern->As<CPatternNode>() : nullptr)
        _VisitPatternNode(*pattern_node);
    if (const CNodeRef guard = case_stmt.GetGuard()) _VisitNode(*guard);
    if (const CNodeRef body = case_stmt.GetBody()) _VisitNode(*body);
}

void CNodeWalker::_VisitPatternNode(CPatternNode& pattern_node) {
    const CRecursionScope recursion;
    Py_ssize_t first = 0;
    if (pattern_node.As<CClassPatternNode>() != nullptr) {
        _VisitNode(*pattern_node.GetChild(0));
        first = 1;
    } else if (pattern_node.As<CClassArgumentPatternNode>() != nullptr && pattern_node.IsToken(1, "=")) {
        first = 2;
    }
    for (Py_ssize_t i = first; i < pattern_node.fChildren.Size(); ++i) {
        const CNodeRef child = pattern_node.GetChild(i);
        if (child->HasText("_")) continue;
        if (child->As<CNameLiteral>() != nullptr) {
            _AddNameDefined(child->fText);
        } else if (child->As<CExpression>() != nullptr) {
            _VisitNode(*child);
        } else if (CPatternNode* const inner = child->As<CPatternNode>()) {
            _VisitPatternNode(*inner);
        }
    }
}

}  // namespace codeloom
