#include "rules/comprehensions.h"

#include <algorithm>
#include <vector>

#include "rules/expression_kinds.h"
#include "rules/name_set.h"
#include "syntax/atoms.h"
#include "syntax/definitions.h"

namespace codeloom {

namespace {

constexpr int kRefusesYield = 308;

struct CScope {
    enum class EKind : uint8_t { kOther, kClass, kComprehension };

    EKind kind = EKind::kOther;
    EExpression comprehension = EExpression::kGenerator;  // of one
    CNameSet targets;                                     // of its clauses, as far as they were read
    CNameSet assigned;                                    // by `:=` right in it
};

bool HasWordOfInterest(const CRawLogical& line) {
    return std::any_of(line.tokens.begin(), line.tokens.end(), [](const CRawToken& token) {
        return token.type == kTokenId_COLONEQUAL || token.word == EWord::kYield;
    });
}

// Visits in the interpreter's order: a comprehension's clauses come before its element.
class CComprehensionCheck {
  public:
    CComprehensionCheck(const CRuleContext& context, bool in_class)
        : _fContext(context), _fTree(context.tree) {
        _fScopes.emplace_back().kind = in_class ? CScope::EKind::kClass : CScope::EKind::kOther;
    }

    void Visit(const CTreeNode& node, const CTreeNode* parent = nullptr) {
        const bool is_word_of_yield = parent != nullptr && parent->Is(ENodeKind::kYield);
        if (IsYield(node) && !is_word_of_yield) _CheckYield(node);
        if (node.IsLeaf() || _fDepth > CRuleContext::kMaxDepth) return;
        ++_fDepth;
        if (HasTokenAt(_fTree, node, 1, kTokenId_COLONEQUAL)) _CheckWalrus(node);
        if (LastChild(_fTree, node).Is(ENodeKind::kCompFor)) {
            _VisitComprehension(node, parent);
        } else if (node.Is(ENodeKind::kLambda) || node.Is(ENodeKind::kFuncdef)) {
            _VisitBody(node, CScope::EKind::kOther);
        } else if (node.Is(ENodeKind::kClassdef)) {
            _VisitBody(node, CScope::EKind::kClass);
        } else {
            for (const CTreeNode& child : _fTree.Children(node)) Visit(child, &node);
        }
        --_fDepth;
    }

  private:
    // Defaults and bases belong outside.
    void _VisitBody(const CTreeNode& node, CScope::EKind kind) {
        const std::span<const CTreeNode> children = _fTree.Children(node);
        for (const CTreeNode& child : children.first(children.size() - 1)) Visit(child, &node);
        _fScopes.emplace_back().kind = kind;
        Visit(children.back(), &node);
        _fScopes.pop_back();
    }

    void _VisitComprehension(const CTreeNode& node, const CTreeNode* parent) {
        const CCompClause first = CompClauseOf(_fTree, LastChild(_fTree, node));
        _VisitIterable(*first.iterable);
        CScope& scope = _fScopes.emplace_back();
        scope.kind = CScope::EKind::kComprehension;
        if (parent != nullptr && parent->Is(ENodeKind::kAtom))
            scope.comprehension = KindOfExpression(_fTree, *parent);
        _BindTarget(*first.target);
        if (first.next != nullptr) _VisitClause(*first.next, &node);
        for (const CTreeNode& child : _fTree.Children(node).first(node.child_count - 1)) Visit(child, &node);
        _fScopes.pop_back();
    }

    // What follows the first `for`: another one, or an `if`.
    void _VisitClause(const CTreeNode& clause, const CTreeNode* parent) {
        if (++_fDepth > CRuleContext::kMaxDepth) return;
        if (clause.Is(ENodeKind::kCompFor)) {
            const CCompClause parts = CompClauseOf(_fTree, clause);
            _BindTarget(*parts.target);
            _VisitIterable(*parts.iterable);
            if (parts.next != nullptr) _VisitClause(*parts.next, parent);
        } else {
            Visit(_fTree.Child(clause, 1), &clause);
            if (const CTreeNode* const next = TryChild(_fTree, clause, 2)) _VisitClause(*next, parent);
        }
        --_fDepth;
    }

    void _VisitIterable(const CTreeNode& iterable) {
        ++_fIterableDepth;
        Visit(iterable);
        --_fIterableDepth;
    }

    void _BindTarget(const CTreeNode& target) {
        const CTreeNode& shown = DropParentheses(_fTree, target);
        if (shown.Is(ENodeKind::kNameLiteral)) return _BindName(shown);
        if (shown.Is(ENodeKind::kStar)) return _BindTarget(StarredExpressionOf(_fTree, shown));
        if (_fDepth > CRuleContext::kMaxDepth) return;
        ++_fDepth;
        const CItems items = ItemsOf(_fTree, shown);
        for (uint32_t i = 0; i < items.count; ++i)
            if (const CTreeNode* const item = items.At(_fTree, i)) _BindTarget(*item);
        if (items.count == 0) Visit(shown);
        --_fDepth;
    }

    void _BindName(const CTreeNode& name) {
        const std::string_view text = _fTree.Text(name);
        if (_fScopes.back().assigned.Has(text))
            _fContext.Report(
                ECode::kWalrusRebinds, name,
                Joined("comprehension inner loop cannot rebind assignment expression target '", text, "'"));
        _fScopes.back().targets.Add(text);
    }

    void _CheckYield(const CTreeNode& node) {
        const CScope& scope = _fScopes.back();
        if (scope.kind != CScope::EKind::kComprehension || _fContext.language.version < kRefusesYield) return;
        _fContext.Report(ECode::kYieldInComprehension, node,
                         Joined("'yield' inside ", TextOfKind(scope.comprehension)));
    }

    void _CheckWalrus(const CTreeNode& named) {
        if (_fIterableDepth > 0)
            return _fContext.Report(
                ECode::kWalrusInIterable, named,
                "assignment expression cannot be used in a comprehension iterable expression");
        const CTreeNode& name = AssignedNameOf(_fTree, named);
        if (_fScopes.back().kind == CScope::EKind::kComprehension) _CheckTarget(named, _fTree.Text(name));
    }

    // The name is bound in the scope around the comprehensions.
    void _CheckTarget(const CTreeNode& named, std::string_view name) {
        _fScopes.back().assigned.Add(name);
        for (size_t i = _fScopes.size(); i-- > 0;) {
            const CScope& scope = _fScopes[i];
            if (scope.kind == CScope::EKind::kOther) return;
            if (scope.kind == CScope::EKind::kClass)
                return _fContext.Report(
                    ECode::kWalrusInClassComprehension, named,
                    "assignment expression within a comprehension cannot be used in a class body");
            if (scope.targets.Has(name))
                return _fContext.Report(
                    ECode::kWalrusRebinds, named,
                    Joined("assignment expression cannot rebind comprehension iteration variable '", name,
                           "'"));
        }
    }

    const CRuleContext& _fContext;
    const CTree& _fTree;
    std::vector<CScope> _fScopes;  // the innermost last
    int _fIterableDepth = 0;
    int _fDepth = 0;
};

}  // namespace

void CheckComprehensions(const CRuleContext& context, bool in_class) {
    if (HasWordOfInterest(context.tree.Line()))
        CComprehensionCheck(context, in_class).Visit(context.tree.fRoot);
}

}  // namespace codeloom
