// Assignments: which name receives what.
#include <algorithm>
#include <climits>

#include "host/errors.h"
#include "neighbours/imported_names.h"
#include "strutils/text.h"
#include "symbolinfo/module_constants.h"
#include "walker/node_walker.h"

namespace codeloom {

namespace {

// A comma list, or brackets that may hold one; null for any other node.
CExpression* AsSequence(const CNode& node) {
    if (CTestListStarExpr* const list = node.As<CTestListStarExpr>()) return list;
    return node.As<CAtom>();
}

// After what the whole target receives, what position `i` of it does.
CBytesOrNone PositionTrailer(const CBytesOrNone& extra_trailer, int i) {
    return Utf8Concat4(extra_trailer, nb::bytes("["), BytesForInteger(i), nb::bytes("]"));
}

// The expression at `i` of the right side, as long as that can be taken apart.
CExpressionRef PairedWith(CExpression* rhs, const CBytesOrNone& extra_trailer, int i) {
    const bool has_pair = rhs != nullptr && extra_trailer.is_none() && i < rhs->GetSubExprCount();
    return has_pair ? rhs->GetSubExpr(i) : CExpressionRef();
}

}  // namespace

void CNodeWalker::_VisitExprStmt(CExprStmt& node) {
    if (node.GetAnnotatedAssignNode()) return _VisitAnnotatedAssign(node);
    if (node.GetEqualCount() != 0) return _VisitAssignment(node);
    if (!node.GetAugAssignOp().is_none()) return _VisitAugAssign(node);
    _VisitChildren(node);
}

void CNodeWalker::_VisitAssignment(CExprStmt& node) {
    const int count = static_cast<int>(std::clamp<Py_ssize_t>(node.GetEqualCount(), -1, INT_MAX));
    if (count == 0) return _VisitChildren(node);
    const CNodeRef rhs = node.GetPostEqualsTestExpr(count - 1);
    for (int i = 0; i < count; ++i) {
        const CNodeRef target = i == 0 ? node.GetInitialTestExpr() : node.GetPostEqualsTestExpr(i - 1);
        _ProcessTargets(*target, rhs);
        _VisitStoreContextNode(*target);
    }
    _VisitNode(*rhs);
}

void CNodeWalker::_VisitAugAssign(CExprStmt& node) {
    _VisitChildren(node);
}

void CNodeWalker::_VisitAnnotatedAssign(CExprStmt& node) {
    const CNodeRef target = node.GetInitialTestExpr();
    _VisitStoreContextNode(*target);
    const CRef<CAnnotatedAssignNode> annotation = node.GetAnnotatedAssignNode();
    if (!annotation) return;
    _VisitNode(*annotation);
    if (const CNodeRef value = annotation->GetPostEqualsTestExpr()) _ProcessTargets(*target, value);
}

// Once a trailer is in force, the right side isn't taken apart any more. After a starred target positions
// aren't corrected.
void CNodeWalker::_ProcessTargets(CNode& lhs, CNodeRef rhs, CBytesOrNone extra_trailer) {
    CExpression* const targets = AsSequence(lhs);
    if (targets == nullptr) return _AppendEquivNode(lhs, rhs, extra_trailer);
    const CRecursionScope recursion;
    CExpression* const values = rhs ? AsSequence(*rhs) : nullptr;
    const int count = targets->GetSubExprCount();
    for (int i = 0; i < count; ++i) {
        const CExpressionRef value = PairedWith(values, extra_trailer, i);
        const CExpressionRef target = targets->GetSubExpr(i);
        if (CStarExpression* const starred = target->As<CStarExpression>()) {
            _ProcessStarredTarget(*starred);
        } else if (value) {
            _ProcessTargets(*target, CNodeRef(value.get()));
        } else {
            _ProcessTargets(*target, rhs, PositionTrailer(extra_trailer, i));
        }
    }
}

// A list, whatever the right side could say.
void CNodeWalker::_ProcessStarredTarget(CStarExpression& target) {
    const CBytesOrNone name = _TextForNode(*target.GetStarredExpression());
    if (name.is_none()) return;
    _AddNameDefined(name);
    _AddTypeEquiv(name, gInstanceNames.kListInstanceName);
}

}  // namespace codeloom
