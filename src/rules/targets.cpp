#include "rules/targets.h"

#include "rules/expression_kinds.h"
#include "syntax/atoms.h"
#include "syntax/imports.h"
#include "syntax/statements.h"

namespace codeloom {

namespace {

constexpr int kRefusesDeletedDebug = 310;
constexpr uint32_t kMaxBeforeStar = 255;

// `None` in Python 2, where it is a name that can't be bound.
bool IsNoneName(const CTreeNode& leaf) {
    return leaf.Is(ENodeKind::kNameLiteral) && IsWord(leaf, EWord::kNoneValue);
}

// Of a node that is an attribute or a name, the leaf that is bound.
const CTreeNode* BoundLeaf(const CTree& tree, const CTreeNode& node, EExpression kind) {
    const CTreeNode& shown = DropParentheses(tree, node);
    if (kind == EExpression::kName) return &shown;
    return kind == EExpression::kAttribute ? DotNameOf(tree, ChainOf(tree, shown).trailers.back()) : nullptr;
}

// Where `=` is a usual slip for `==`.
bool MayBeComparison(EExpression kind) {
    return kind >= EExpression::kNamed && kind != EExpression::kGenerator;
}

// Checks one target, down to its parts, until a fault is found.
class CTargetCheck {
  public:
    CTargetCheck(const CRuleContext& context, ETargetUse use) : _fContext(context), _fUse(use) {}

    // False after a fault.
    bool Check(const CTreeNode& target, int depth = 0) const {
        if (target.Is(ENodeKind::kNameLiteral)) return _CheckLeaf(target);
        if (depth > CRuleContext::kMaxDepth) return true;
        const EExpression kind = KindOfExpression(_fContext.tree, target);
        switch (kind) {
            case EExpression::kName:
            case EExpression::kAttribute:
                return !_fContext.MayHaveUnbindableNames() ||
                       _CheckLeaf(*BoundLeaf(_fContext.tree, target, kind));
            case EExpression::kSubscript:
                return true;
            case EExpression::kList:
            case EExpression::kTuple:
                return _CheckItems(DropParentheses(_fContext.tree, target), depth);
            case EExpression::kStarred:
                return _CheckLoneStar(target);
            default:
                return _Refuse(target, kind, depth == 0);
        }
    }

  private:
    bool _IsDelete() const { return _fUse == ETargetUse::kDelete; }

    bool _CheckLeaf(const CTreeNode& name) const {
        if (!_fContext.MayHaveUnbindableNames()) return true;
        if (IsNoneName(name)) {
            CheckBoundName(_fContext, name);
            return false;
        }
        if (_fContext.tree.Text(name) != kDebugName) return true;
        if (_IsDelete() && _fContext.language.version < kRefusesDeletedDebug) return true;
        _fContext.Report(ECode::kCannotBindName, name,
                         Joined(_IsDelete() ? "cannot delete " : "cannot assign to ", kDebugName));
        return false;
    }

    bool _CheckItems(const CTreeNode& target, int depth) const {
        const CTree& tree = _fContext.tree;
        const CItems items = ItemsOf(tree, target);
        bool has_star = false;
        for (uint32_t i = 0; i < items.count; ++i) {
            const CTreeNode* const item = items.At(tree, i);
            if (item == nullptr) continue;
            const bool is_star = item->Is(ENodeKind::kStar);
            if (is_star && !_CheckStar(*item, i, has_star)) return false;
            has_star |= is_star;
            if (!Check(is_star ? StarredExpressionOf(tree, *item) : *item, depth + 1)) return false;
        }
        return true;
    }

    bool _CheckStar(const CTreeNode& star, uint32_t index, bool has_star) const {
        if (_IsDelete()) return _Refuse(star, EExpression::kStarred, false);
        const bool is_late = index > kMaxBeforeStar;
        if (!has_star && !is_late) return true;
        _fContext.Report(ECode::kMultipleStars, star,
                         has_star ? "multiple starred expressions in assignment"
                                  : "too many expressions in star-unpacking assignment");
        return false;
    }

    // One in parentheses is refused wherever it is.
    bool _CheckLoneStar(const CTreeNode& target) const {
        if (!target.Is(ENodeKind::kStar)) return false;
        if (_IsDelete()) return _Refuse(target, EExpression::kStarred, false);
        _fContext.Report(ECode::kMisplacedStar, target,
                         "starred assignment target must be in a list or tuple");
        return false;
    }

    bool _Refuse(const CTreeNode& target, EExpression kind, bool may_be_comparison) const {
        const std::string_view what = TextOfKind(kind);
        if (_IsDelete()) {
            _fContext.Report(ECode::kCannotDelete, target, Joined("cannot delete ", what));
        } else {
            const bool is_slip =
                may_be_comparison && _fUse == ETargetUse::kStatement && MayBeComparison(kind);
            _fContext.Report(ECode::kCannotAssign, target,
                             Joined("cannot assign to ", what,
                                    is_slip ? " here. Maybe you meant '==' instead of '='?" : ""),
                             is_slip ? "write '==' to compare" : "");
        }
        return false;
    }

    const CRuleContext& _fContext;
    const ETargetUse _fUse;
};

bool IsSingleTarget(EExpression kind) {
    return kind == EExpression::kName || kind == EExpression::kAttribute || kind == EExpression::kSubscript;
}

void CheckAugmented(const CRuleContext& context, const CTreeNode& target) {
    const EExpression kind = KindOfExpression(context.tree, target);
    if (IsSingleTarget(kind)) return CheckTarget(context, target, ETargetUse::kAssign);
    context.Report(ECode::kCannotAugment, target,
                   Joined("'", TextOfKind(kind), "' is an illegal expression for augmented assignment"));
}

void CheckAnnotated(const CRuleContext& context, const CTreeNode& target) {
    const EExpression kind = KindOfExpression(context.tree, target);
    if (IsSingleTarget(kind)) return CheckTarget(context, target, ETargetUse::kAssign);
    const bool is_sequence = kind == EExpression::kList || kind == EExpression::kTuple;
    context.Report(ECode::kCannotAnnotate, target,
                   is_sequence ? Joined("only single target (not ", TextOfKind(kind), ") can be annotated")
                               : "illegal target for annotation");
}

}  // namespace

void CheckTarget(const CRuleContext& context, const CTreeNode& target, ETargetUse use) {
    CTargetCheck(context, use).Check(target);
}

void CheckBoundName(const CRuleContext& context, const CTreeNode& name) {
    if (!context.MayHaveUnbindableNames()) return;
    if (context.tree.Text(name) == kDebugName)
        context.Report(ECode::kCannotBindName, name, "cannot assign to __debug__");
    if (IsNoneName(name)) context.Report(ECode::kCannotBindName, name, "cannot assign to None");
}

void CheckAssignment(const CRuleContext& context, const CTreeNode& statement) {
    const CTree& tree = context.tree;
    const CTreeNode& first = tree.Child(statement, 0);
    if (AnnotatedAssignOf(tree, statement) != nullptr) return CheckAnnotated(context, first);
    const uint32_t equal_count = EqualCountOf(tree, statement);
    if (equal_count == 0) return CheckAugmented(context, first);
    for (uint32_t i = 0; i < equal_count; ++i) {
        const CTreeNode& target = TargetOf(tree, statement, i);
        if (IsYield(target))
            return context.Report(ECode::kCannotAssign, target,
                                  "assignment to yield expression not possible");
        if (!CTargetCheck(context, ETargetUse::kStatement).Check(target)) return;
    }
}

void CheckImportedNames(const CRuleContext& context, const CTreeNode& names) {
    if (!context.MayHaveUnbindableNames()) return;
    ForEachImportedName(context.tree, names, [&](const CImportedName& imported) {
        CheckBoundName(context, imported.as_name != nullptr ? *imported.as_name : *imported.name);
    });
}

void CheckWalrus(const CRuleContext& context, const CTreeNode& named) {
    const CTreeNode& name = AssignedNameOf(context.tree, named);
    if (name.Is(ENodeKind::kNameLiteral)) return CheckBoundName(context, name);
    const EExpression kind = KindOfExpression(context.tree, name);
    context.Report(ECode::kWalrusTarget, name,
                   Joined("cannot use assignment expressions with ", TextOfKind(kind)));
}

}  // namespace codeloom
