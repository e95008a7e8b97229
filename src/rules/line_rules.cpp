#include "rules/line_rules.h"

#include "rules/arguments.h"
#include "rules/comprehensions.h"
#include "rules/literals.h"
#include "rules/parameters.h"
#include "rules/patterns.h"
#include "rules/stars.h"
#include "rules/targets.h"
#include "rules/versions.h"
#include "syntax/definitions.h"
#include "syntax/imports.h"
#include "syntax/statements.h"

namespace codeloom {

namespace {

constexpr uint64_t BitsOf(std::initializer_list<ENodeKind> kinds) {
    uint64_t bits = 0;
    for (const ENodeKind kind : kinds) bits |= CTree::BitOf(kind);
    return bits;
}

// A line with none of these keeps every rule. Lists of arguments have theirs only with an argument that is
// more than an expression.
constexpr uint64_t kKindsWithRules =
    BitsOf({ENodeKind::kExprStmt, ENodeKind::kFor, ENodeKind::kCompFor, ENodeKind::kWithItem, ENodeKind::kDel,
            ENodeKind::kUsedArgument, ENodeKind::kNamedExpr, ENodeKind::kLambda, ENodeKind::kFuncdef,
            ENodeKind::kClassdef, ENodeKind::kWithTypeParameters, ENodeKind::kCase, ENodeKind::kImportNames,
            ENodeKind::kFromImport, ENodeKind::kExceptClause, ENodeKind::kStar});
constexpr uint64_t kKindsToCheck = kKindsWithRules | CTree::BitOf(ENodeKind::kUsedArglist);

void CheckDefinition(const CRuleContext& context, const CTreeNode& definition) {
    CheckBoundName(context, NameOfFuncdef(context.tree, definition));
    if (definition.Is(ENodeKind::kClassdef)) return CheckBases(context, definition);
    CheckParameters(context, ParametersOfFuncdef(context.tree, definition));
}

void CheckLambda(const CRuleContext& context, const CTreeNode& lambda) {
    if (const CTreeNode* const parameters = ParametersOfLambda(context.tree, lambda))
        CheckParameters(context, *parameters);
}

//   for a in b if lambda: c    no version of the language from 3.9 on reads it
void CheckCondition(const CRuleContext& context, const CTreeNode& condition) {
    constexpr int kRefusesLambda = 309;
    const CTreeNode* const expression = TryChild(context.tree, condition, 1, ENodeKind::kLambda);
    if (expression != nullptr && context.language.version >= kRefusesLambda)
        context.Report(ECode::kMissingToken, *expression,
                       "a lambda must be parenthesized as the condition of a comprehension");
}

// One with `async` has the clause itself within.
void CheckClause(const CRuleContext& context, const CTreeNode& clause) {
    if (HasWordAt(context.tree, clause, 0, EWord::kAsync)) return;
    const CCompClause parts = CompClauseOf(context.tree, clause);
    CheckTarget(context, *parts.target, ETargetUse::kAssign);
    if (parts.next != nullptr && HasWordAt(context.tree, *parts.next, 0, EWord::kIf))
        CheckCondition(context, *parts.next);
}

// `if a: type X = int`, a body on the row of its header
void CheckAliases(const CRuleContext& context) {
    const CTree& tree = context.tree;
    for (const CTreeNode& node : tree.NodesBelowRoot()) {
        const bool is_alias = node.Is(ENodeKind::kExprStmt) && !node.IsLeaf() && node.token > 0 &&
                              tree.Line().tokens[node.token - 1].word == EWord::kType;
        if (is_alias && !tree.IsRoot(node))
            CheckDeferred(context, ValueOfAssignment(tree, node), "a type alias");
    }
}

void CheckNode(const CRuleContext& context, const CTreeNode& node) {
    const CTree& tree = context.tree;
    switch (node.kind) {
        case ENodeKind::kExprStmt:
            return CheckAssignment(context, node);
        case ENodeKind::kFor:
            return CheckTarget(context, *PartsOfFor(tree, node).target, ETargetUse::kAssign);
        case ENodeKind::kCompFor:
            return CheckClause(context, node);
        case ENodeKind::kWithItem:
            return CheckTarget(context, TargetOfWithItem(tree, node), ETargetUse::kAssign);
        case ENodeKind::kDel:
            return CheckTarget(context, *ExpressionAfterKeyword(tree, node), ETargetUse::kDelete);
        case ENodeKind::kUsedArglist:
            return CheckArguments(context, node);
        case ENodeKind::kUsedArgument:
            return CheckArgument(context, node);
        case ENodeKind::kNamedExpr:
            return CheckWalrus(context, node);
        case ENodeKind::kLambda:
            return CheckLambda(context, node);
        case ENodeKind::kFuncdef:
        case ENodeKind::kClassdef:
            return CheckDefinition(context, node);
        case ENodeKind::kWithTypeParameters:
            return CheckTypeParameters(context, node);
        case ENodeKind::kCase:
            return CheckPattern(context, PatternOfCase(tree, node));
        case ENodeKind::kImportNames:
            return CheckImportedNames(context, NamesOfImport(tree, node));
        case ENodeKind::kFromImport:
            if (StarOfFromImport(tree, node) == nullptr)
                CheckImportedNames(context, NamesOfFromImport(tree, node));
            return;
        case ENodeKind::kExceptClause:
            if (const CTreeNode* const target = TargetOfExcept(tree, node))
                CheckTarget(context, *target, ETargetUse::kAssign);
            return;
        default:
            return;
    }
}

// `a = b` and `a.b = c`: no rule refuses these.
bool IsPlainAssignment(const CTree& tree) {
    constexpr uint64_t kWordsOfOthers =
        kDebugNameBit | WordBits(EWord::kNoneValue, EWord::kAwait, EWord::kType);
    const CTreeNode& root = tree.fRoot;
    if (root.kind != ENodeKind::kExprStmt || root.child_count != 3 ||
        tree.Line().MayHaveWords(kWordsOfOthers) || !HasTokenAt(tree, root, 1, kTokenId_EQUAL))
        return false;
    const CTreeNode& target = tree.Child(root, 0);
    if (target.Is(ENodeKind::kNameLiteral)) return true;
    return target.Is(ENodeKind::kAtomExpr) && HasTokenAt(tree, LastChild(tree, target), 0, kTokenId_DOT);
}

// A statement has no other of its kind within it, but expressions do.
uint64_t KindsBelowRoot(const CTree& tree) {
    const bool is_statement = tree.fRoot.Is(ENodeKind::kStmt) && !tree.fRoot.IsLeaf();
    return is_statement ? tree.Kinds() & ~CTree::BitOf(tree.fRoot.kind) : tree.Kinds();
}

}  // namespace

bool MayBreakLineRule(const CTree& tree, const CLanguage& language) {
    const uint64_t kinds = tree.Kinds() & kKindsWithRules;
    const bool is_plain =
        kinds == 0 || (kinds == CTree::BitOf(ENodeKind::kExprStmt) && IsPlainAssignment(tree));
    return !is_plain || MayHaveBadLiteral(tree.Line()) || language.version < kNeedsNoVersionCheck;
}

void CheckLine(const CRuleContext& context, const CLineSetting& setting) {
    const CTree& tree = context.tree;
    if (context.language.version < kNeedsNoVersionCheck) CheckVersion(context);
    CheckLiterals(tree.Line(), context.language, context.problems);
    if (tree.fIsEmpty || tree.fRoot.IsLeaf() || (tree.Kinds() & kKindsWithRules) == 0) return;
    if (setting.defers_annotations) CheckAnnotations(context);
    CheckNode(context, tree.fRoot);
    if ((KindsBelowRoot(tree) & kKindsWithRules) != 0) {
        for (const CTreeNode& node : tree.NodesBelowRoot())
            if ((CTree::BitOf(node.kind) & kKindsToCheck) != 0 && !node.IsLeaf() && !tree.IsRoot(node))
                CheckNode(context, node);
    }
    if (tree.HasKind(ENodeKind::kStar)) CheckStars(context);
    if (tree.HasKind(ENodeKind::kCompFor)) CheckComprehensions(context, setting.in_class);
    const bool is_alias = tree.Line().type == ELogicalType::kTypeStatement;
    if (is_alias && tree.fRoot.Is(ENodeKind::kExprStmt))
        CheckDeferred(context, ValueOfAssignment(tree, tree.fRoot), "a type alias");
    if (!is_alias && tree.Line().MayHaveWords(WordBits(EWord::kType))) CheckAliases(context);
}

}  // namespace codeloom
