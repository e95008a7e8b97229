#include "syntax/arguments.h"

namespace codeloom {

uint32_t CountArguments(const CTree& tree, const CTreeNode& arguments) {
    uint32_t count = 0;
    ForEachArgument(tree, arguments, [&](const CArgumentParts&) { ++count; });
    return count;
}

CParameter PartsOfParameter(const CTree& tree, const CTreeNode& parameter) {
    CParameter parts;
    if (!parameter.Is(ENodeKind::kParameterDef)) {
        parts.name = &parameter;
    } else if (parameter.child_count == 3 && HasTokenAt(tree, parameter, 0, kTokenId_LPAR)) {
        parts.nested = &tree.Child(parameter, 1);
    } else {
        parts.name = &tree.Child(parameter, 0);
        if (HasTokenAt(tree, parameter, 1, kTokenId_COLON)) parts.type_expr = TryChild(tree, parameter, 2);
    }
    return parts;
}

// The name, an annotation or a default, by what is before it.
void CParameterReader::_ReadPart(const CTreeNode& child) {
    if (const EStars stars = StarsOf(child); stars != EStars::kNone) {
        _fCurrent.stars = stars;
    } else if (IsToken(child, kTokenId_EQUAL)) {
        _fPart = EPart::kDefault;
    } else if (IsToken(child, kTokenId_COLON)) {
        _fPart = EPart::kAnnotation;
    } else if (IsToken(child, kTokenId_SLASH)) {
        return;
    } else if (_fPart == EPart::kDefault) {
        _fCurrent.value = &child;
    } else if (_fPart == EPart::kAnnotation) {
        _fCurrent.type_expr = &child;
    } else if (child.Is(ENodeKind::kNameLiteral)) {
        _fCurrent.name = &child;
    }
}

}  // namespace codeloom
