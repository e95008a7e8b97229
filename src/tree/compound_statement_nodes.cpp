#include "tree/compound_statement_nodes.h"

#include "tree/child_list.h"

namespace codeloom {

// CIfStmt

CExpressionRef CIfStmt::GetTestExpression() {
    return ChildAs<CExpression>(kTestIndex);
}

// CForStmt

CNodeRef CForStmt::GetTarget() {
    return ChildAs<CNode>(kTargetIndex);
}

CNodeRef CForStmt::GetInExpression() {
    return ChildAs<CNode>(kIterableIndex);
}

CNodeRef CForStmt::GetBody() {
    return ChildAs<CNode>(kBodyIndex);
}

CNodeRef CForStmt::GetElseBody() {
    const bool has_else = !fChildren.IsNone() && ChildCount() == kCountWithElse;
    return has_else ? ChildAs<CNode>(-1) : CNodeRef();
}

// CWithItem, CWithStmt

CNodeRef CWithItem::GetExpression() {
    return ChildAs<CNode>(kExpressionIndex);
}

CNodeRef CWithItem::GetTarget() {
    return ChildAs<CNode>(kTargetIndex);
}

CWithItemList CWithStmt::GetWithItems() {
    CWithItemList items;
    for (Py_ssize_t i = 0; i < ListedCount(*this); ++i)
        if (CWithItem* const item = TryChild<CWithItem>(i)) items.append(item->Self());
    return items;
}

// CExceptClause

CNodeRef CExceptClause::GetExceptionType() {
    return GetChild(kTypeIndex);
}

// The target is last, after `as` or a comma: both forms of the rule are in force.
CNodeRef CExceptClause::GetTarget() {
    const Py_ssize_t separator_i = fChildren.IsNone() ? -1 : ChildCount() - 2;
    const bool has_target = separator_i >= 1 && TextIsOneOf(ChildText(separator_i), ",", "as");
    return has_target ? GetChild(separator_i + 1) : CNodeRef();
}

// CMatchStmt, CCaseStmt

CExpressionRef CMatchStmt::GetTestExpression() {
    return ChildAs<CExpression>(kSubjectIndex);
}

CNodeRef CCaseStmt::GetPattern() {
    return ChildAs<CNode>(kPatternIndex);
}

CNodeRef CCaseStmt::GetGuard() {
    return ChildCount() >= kLeastCountWithGuard ? ChildAs<CNode>(kGuardIndex) : CNodeRef();
}

CNodeRef CCaseStmt::GetBody() {
    return IsToken(-1, ":") ? CNodeRef() : ChildAs<CNode>(-1);
}

}  // namespace codeloom
