#include "tree/definition_nodes.h"

#include "tree/child_list.h"

namespace codeloom {

// CClassdefStmt

CTextOrNone CClassdefStmt::GetClassName() {
    return ChildText(kNameIndex);
}

CArgumentList CClassdefStmt::GetBaseClassList() {
    const bool has_arguments = ChildCount() > kArgumentsIndex && ChildAt(kOpenIndex).HasText("(") &&
                               !ChildAt(kArgumentsIndex).HasText(")");
    return has_arguments ? GetUsedArgInfoList(ChildAs<CNode>(kArgumentsIndex)) : CArgumentList();
}

// CFuncdefStmt

CTextOrNone CFuncdefStmt::GetFunctionName() {
    return ChildText(kNameIndex);
}

CRef<CParametersNode> CFuncdefStmt::GetParameters() {
    return ChildAs<CParametersNode>(kParametersIndex);
}

CExpressionRef CFuncdefStmt::GetReturnType() {
    const bool has_arrow = IsToken(kArrowIndex, "->") && ChildCount() > kReturnTypeIndex;
    return has_arrow ? ChildAs<CExpression>(kReturnTypeIndex) : CExpressionRef();
}

CNodeRef CFuncdefStmt::GetSuite() {
    return ChildCount() == 0 ? CNodeRef() : ChildAs<CNode>(-1);
}

// CSingleDecorator

CNodeRef CSingleDecorator::GetDottedName() {
    return ChildAs<CNode>(kNameIndex);
}

CArgumentList CSingleDecorator::GetUsedArgList() {
    const bool has_arguments =
        ChildCount() > kCloseIndex && IsToken(kOpenIndex, "(") && IsToken(kCloseIndex, ")");
    return has_arguments ? GetUsedArgInfoList(ChildAs<CNode>(kArgumentsIndex)) : CArgumentList();
}

// CTypeParameter

CTextOrNone CTypeParameter::GetName() {
    switch (ChildCount()) {
        case 1:
            return ChildText(0);
        case 2:
            return ChildText(1);
        default:
            return ChildText(-3);  // before the colon and the bound
    }
}

CTextOrNone CTypeParameter::GetPrefix() {
    CTextOrNone text = ChildText(0);
    return TextIsOneOf(text, "*", "**") ? text : CTextOrNone();
}

CNodeRef CTypeParameter::GetSpecNode() {
    return ChildCount() >= 3 ? ChildAs<CNode>(-1) : CNodeRef();
}

// CWithTypeParameters

CNodeList CWithTypeParameters::GetTypeParameters() {
    CNodeList parameters;
    for (Py_ssize_t i = 0; i + 1 < ListedCount(*this); ++i) parameters.append(ChildAs<CNode>(i).Release());
    return parameters;
}

CNodeRef CWithTypeParameters::GetTypeParameterScopedStatement() {
    return ChildAs<CNode>(-1);
}

}  // namespace codeloom
