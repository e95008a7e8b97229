#include "rules/stars.h"

#include "syntax/atoms.h"
#include "syntax/statements.h"

namespace codeloom {

namespace {

// Its targets have a rule of their own.
bool IsTarget(const CTree& tree, const CTreeNode& parent, uint32_t index) {
    switch (parent.kind) {
        case ENodeKind::kDel:
        case ENodeKind::kWithItem:
            return true;
        case ENodeKind::kFor:
        case ENodeKind::kCompFor:
            return HasWordAt(tree, parent, index + 1, EWord::kIn);
        case ENodeKind::kExprStmt:
            return index + 1 < parent.child_count;
        default:
            return false;
    }
}

// A list of items, an argument, an annotation of `*args`, a default of a type parameter.
bool MayHoldStar(const CTree& tree, const CTreeNode& parent) {
    switch (parent.kind) {
        case ENodeKind::kTrailer:
        case ENodeKind::kParameterDef:
        case ENodeKind::kUsedArglist:
        case ENodeKind::kDefiningArglist:
        case ENodeKind::kTypeParameter:
            return true;
        default:
            return HasToken(tree, parent, kTokenId_COMMA);
    }
}

void CheckChildren(const CRuleContext& context, const CTreeNode& parent) {
    const CTree& tree = context.tree;
    for (uint32_t i = 0; i < parent.child_count; ++i) {
        const CTreeNode& child = tree.Child(parent, i);
        if (!child.Is(ENodeKind::kStar)) continue;
        const bool is_set = parent.Is(ENodeKind::kAtom) && BracketOf(tree, parent) != EBracket::kParenthesis;
        if (is_set || MayHoldStar(tree, parent) || IsTarget(tree, parent, i)) continue;
        context.Report(ECode::kMisplacedStar, child,
                       parent.Is(ENodeKind::kAtom) ? "cannot use starred expression here"
                                                   : "can't use starred expression here");
    }
}

}  // namespace

void CheckStars(const CRuleContext& context) {
    const CTree& tree = context.tree;
    if (tree.fRoot.Is(ENodeKind::kStar)) {
        context.Report(ECode::kMisplacedStar, tree.fRoot, "can't use starred expression here");
        return;
    }
    for (const CTreeNode& node : tree.NodesBelowRoot())
        if (!node.IsLeaf() && !tree.IsRoot(node)) CheckChildren(context, node);
    CheckChildren(context, tree.fRoot);
}

}  // namespace codeloom
