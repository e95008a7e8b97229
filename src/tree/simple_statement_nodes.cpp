#include "tree/simple_statement_nodes.h"

#include "tree/atom_nodes.h"
#include "tree/child_list.h"

namespace codeloom {

namespace {

CNameList NamesBehindKeyword(const CNode& statement) {
    CNameList names;
    for (Py_ssize_t i = 1; i < ListedCount(statement); ++i)
        if (const CNameLiteral* const name = statement.TryChild<CNameLiteral>(i)) names.append(name->fText);
    return names;
}

}  // namespace

CNodeRef CAnnotatedAssignNode::GetTypeHintNode() {
    return ChildAs<CNode>(kHintIndex);
}

CNodeRef CAnnotatedAssignNode::GetPostEqualsTestExpr() {
    return ChildCount() > kValueIndex ? ChildAs<CNode>(kValueIndex) : CNodeRef();
}

Py_ssize_t CExprStmt::GetEqualCount() {
    Py_ssize_t count = 0;
    for (Py_ssize_t i = 0; i < ListedCount(*this); ++i) count += ChildAt(i).HasText("=");
    return count;
}

CRef<CAnnotatedAssignNode> CExprStmt::GetAnnotatedAssignNode() {
    return CRef<CAnnotatedAssignNode>(TryChild<CAnnotatedAssignNode>(kOperatorIndex));
}

CNodeRef CExprStmt::GetInitialTestExpr() {
    return ChildAs<CNode>(kTargetIndex);
}

CNodeRef CExprStmt::GetPostEqualsTestExpr(int equal_num) {
    const Py_ssize_t child_i = Py_ssize_t{equal_num} * 2 + kFirstValueIndex;
    if (child_i >= ListedCount(*this)) throw nb::value_error("Not enough ='s");
    return ChildAs<CNode>(child_i);
}

// The list is final: hosts rely on `|=` and `@=` being no operators here.
CTextOrNone CExprStmt::GetAugAssignOp() {
    CTextOrNone text = ChildText(kOperatorIndex);
    const bool is_operator =
        TextIsOneOf(text, "+=", "-=", "*=", "/=", "%=", "&=", ",=", "^=", "<<=", ">>=", "**=", "//=");
    return is_operator ? text : CTextOrNone();
}

CNodeRef CReturnStmt::GetValue() {
    return fChildren.Size() > kValueIndex ? ChildAs<CNode>(kValueIndex) : CNodeRef();
}

CNodeList CDelStmt::GetExpressions() {
    CNodeList expressions;
    if (ChildCount() != 2) return expressions;
    const CRef<CTestListStarExpr> comma_list(TryChild<CTestListStarExpr>(kExpressionIndex));
    if (!comma_list) {
        expressions.append(ChildAs<CNode>(kExpressionIndex).Release());
        return expressions;
    }
    const int count = comma_list->GetSubExprCount();
    for (int i = 0; i < count; ++i) expressions.append(comma_list->GetSubExpr(i).Release());
    return expressions;
}

CNameList CGlobalStmt::GetUtf8NameList() {
    return NamesBehindKeyword(*this);
}

CNameList CNonlocalStmt::GetUtf8NameList() {
    return NamesBehindKeyword(*this);
}

}  // namespace codeloom
