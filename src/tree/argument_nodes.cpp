#include "tree/argument_nodes.h"

#include "tree/expression_nodes.h"

namespace codeloom {

// CSingleUsedArgumentNode

CTextOrNone CSingleUsedArgumentNode::GetPrefix() {
    CTextOrNone text = ChildText(0);
    return TextIsOneOf(text, "*", "**") ? text : CTextOrNone();
}

CNodeRef CSingleUsedArgumentNode::GetName() {
    return IsToken(kOperatorIndex, "=") ? ChildAs<CNode>(kNameIndex) : CNodeRef();
}

CNodeRef CSingleUsedArgumentNode::GetValue() {
    return IsToken(kOperatorIndex, "=") ? ChildAs<CNode>(kValueIndex) : CNodeRef(this);
}

bool CSingleUsedArgumentNode::IsUnparenthesizedGenExpr() {
    return ChildCount() == 2 && TryChild<CCompForNode>(1) != nullptr;
}

CNodeRef CSingleUsedArgumentNode::GetNameAssigned() {
    return IsToken(kOperatorIndex, ":=") ? GetChild(kNameIndex) : CNodeRef();
}

CNodeRef CSingleUsedArgumentNode::GetNamedRightHandExpression() {
    return IsToken(kOperatorIndex, ":=") ? GetChild(kValueIndex) : CNodeRef();
}

// CFunctionParameterDef

CNodeRef CFunctionParameterDef::GetNestedListNode() {
    const bool is_tuple = ChildCount() == kCount && IsToken(0, "(");
    return is_tuple ? ChildAs<CNode>(kNestedIndex) : CNodeRef();
}

CNodeRef CFunctionParameterDef::GetName() {
    return GetNestedListNode() ? CNodeRef() : GetChild(kNameIndex);
}

CNodeRef CFunctionParameterDef::GetTypeExpr() {
    const bool has_annotation = ChildCount() == kCount && IsToken(1, ":");
    return has_annotation ? ChildAs<CNode>(kAnnotationIndex) : CNodeRef();
}

}  // namespace codeloom
