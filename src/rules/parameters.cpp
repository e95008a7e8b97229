#include "rules/parameters.h"

#include <algorithm>

#include "rules/expression_kinds.h"
#include "rules/name_set.h"
#include "rules/targets.h"
#include "syntax/atoms.h"
#include "syntax/definitions.h"
#include "syntax/statements.h"
#include "tokenizer/keywords.h"

namespace codeloom {

namespace {

constexpr std::string_view kAnnotation = "an annotation";
constexpr std::string_view kGeneric = "the definition of a generic";

class CDeferredCheck {
  public:
    CDeferredCheck(const CRuleContext& context, std::string_view where)
        : _fContext(context), _fWhere(where) {}

    void Visit(const CTreeNode& node, bool in_comprehension, int depth) const {
        if (node.Is(ENodeKind::kLambda) || depth > CRuleContext::kMaxDepth) return;
        if (IsYield(node)) return _Refuse(node, "yield expression");
        if (IsWord(node, EWord::kAwait) && node.Is(ENodeKind::kKeywordLiteral))
            return _Refuse(node, "await expression");
        if (node.IsLeaf()) return;
        const CTree& tree = _fContext.tree;
        if (HasTokenAt(tree, node, 1, kTokenId_COLONEQUAL)) return _RefuseWalrus(node, in_comprehension);
        in_comprehension |= LastChild(tree, node).Is(ENodeKind::kCompFor);
        for (const CTreeNode& child : tree.Children(node)) Visit(child, in_comprehension, depth + 1);
    }

  private:
    void _Refuse(const CTreeNode& node, std::string_view what) const {
        _fContext.Report(ECode::kNotInTypeExpression, node, Joined(what, " cannot be used within ", _fWhere));
    }

    void _RefuseWalrus(const CTreeNode& node, bool in_comprehension) const {
        if (!in_comprehension) return _Refuse(node, "named expression");
        _fContext.Report(ECode::kNotInTypeExpression, node,
                         Joined("assignment expression within a comprehension cannot be used ",
                                _fWhere == kGeneric ? "within " : "in ", _fWhere));
    }

    const CRuleContext& _fContext;
    const std::string_view _fWhere;
};

// The interpreter's names for the kinds of type parameters.
std::string_view KindOfTypeParameter(EStars stars) {
    if (stars == EStars::kNone) return "TypeVar";
    return stars == EStars::kOne ? "TypeVarTuple" : "ParamSpec";
}

struct CTypeParameterParts {
    const CTreeNode* bound = nullptr;
    const CTreeNode* value = nullptr;  // the default
};

// With both, they are the first and the last child of a node after the colon.
CTypeParameterParts PartsOfTypeParameter(const CTree& tree, const CTreeNode& parameter) {
    const CTreeNode* const spec = SpecOfTypeParameter(tree, parameter);
    if (spec == nullptr) return {};
    if (HasTokenAt(tree, parameter, parameter.child_count - 2, kTokenId_EQUAL)) return {nullptr, spec};
    if (spec->kind == ENodeKind::kNode && HasTokenAt(tree, *spec, 1, kTokenId_EQUAL))
        return {&tree.Child(*spec, 0), &tree.Child(*spec, 2)};
    return {spec, nullptr};
}

// What the parser leaves to the rules: it takes any word for a name, and any statement for a bound. False
// after a fault.
bool CheckPartsAreSound(const CRuleContext& context, const CTreeNode& name,
                        const CTypeParameterParts& parts) {
    if (context.language.IsKeyword(name.word)) {
        const std::string_view word = context.tree.Text(name);
        context.Report(ECode::kKeywordAsName, name,
                       Joined("'", word, "' is a keyword and can't be used as a name"));
        return false;
    }
    for (const CTreeNode* const part : {parts.bound, parts.value}) {
        if (part == nullptr || (part->Is(ENodeKind::kExpression) && !IsStatementWord(part->word))) continue;
        context.Report(ECode::kMissingExpression, *part,
                       Joined("expected an expression after '", part == parts.bound ? ":" : "=", "'"));
        return false;
    }
    return true;
}

void CheckBound(const CRuleContext& context, const CTreeNode& bound, EStars stars) {
    if (bound.Is(ENodeKind::kStar))
        return context.Report(ECode::kMisplacedStar, bound, "can't use starred expression here");
    const bool is_tuple = KindOfExpression(context.tree, bound) == EExpression::kTuple;
    if (stars != EStars::kNone)
        return context.Report(
            ECode::kTypeParameterBound, bound,
            Joined("cannot use ", is_tuple ? "constraints" : "bound", " with ", KindOfTypeParameter(stars)));
    CheckDeferred(context, bound, is_tuple ? "a TypeVar constraint" : "a TypeVar bound");
}

template <class Visit>
void ForEachAnnotation(const CTree& tree, const CTreeNode& function, Visit visit) {
    ForEachParameter(tree, ParametersOfFuncdef(tree, function), [&](const CParameter& parameter) {
        if (parameter.type_expr != nullptr) visit(*parameter.type_expr);
    });
    if (const CTreeNode* const result = ReturnTypeOfFuncdef(tree, function)) visit(*result);
}

template <class Visit>
void ForEachAnnotationBelow(const CTree& tree, Visit visit) {
    const auto visit_statement = [&](const CTreeNode& node) {
        if (node.IsLeaf()) return;
        if (node.Is(ENodeKind::kFuncdef)) ForEachAnnotation(tree, node, visit);
        if (node.Is(ENodeKind::kAnnotatedAssign)) visit(HintOfAnnotatedAssign(tree, node));
    };
    visit_statement(tree.fRoot);
    if (tree.HasKind(ENodeKind::kFuncdef) || tree.HasKind(ENodeKind::kAnnotatedAssign))
        for (const CTreeNode& node : tree.NodesBelowRoot())
            if (!tree.IsRoot(node)) visit_statement(node);
}

bool MayBeWrongInAnnotation(const CRawLogical& embedded) {
    if (embedded.type != ELogicalType::kFstringFieldExp) return false;
    return embedded.MayHaveWords(WordBits(EWord::kYield, EWord::kAwait)) ||
           std::any_of(embedded.tokens.begin(), embedded.tokens.end(),
                       [](const CRawToken& token) { return token.type == kTokenId_COLONEQUAL; });
}

// Annotations, bases and an alias's value are evaluated where the type parameters are known.
void CheckScopedStatement(const CRuleContext& context, const CTreeNode& statement) {
    const CTree& tree = context.tree;
    if (statement.Is(ENodeKind::kClassdef)) {
        if (const CTreeNode* const bases = BasesOfClassdef(tree, statement))
            CheckDeferred(context, *bases, kGeneric);
    } else if (statement.Is(ENodeKind::kFuncdef)) {
        ForEachAnnotation(tree, statement,
                          [&](const CTreeNode& annotation) { CheckDeferred(context, annotation, kGeneric); });
    } else if (statement.Is(ENodeKind::kExprStmt)) {
        CheckDeferred(context, LastChild(tree, statement), "a type alias");
    }
}

}  // namespace

void CheckDeferred(const CRuleContext& context, const CTreeNode& expression, std::string_view where) {
    CDeferredCheck(context, where).Visit(expression, false, 0);
}

void CheckAnnotations(const CRuleContext& context) {
    const CTree& tree = context.tree;
    const bool may_be_wrong = tree.Line().MayHaveWords(WordBits(EWord::kYield, EWord::kAwait)) ||
                              tree.HasKind(ENodeKind::kNamedExpr) || tree.HasKind(ENodeKind::kUsedArgument);
    if (!may_be_wrong) return;
    ForEachAnnotationBelow(
        tree, [&](const CTreeNode& annotation) { CheckDeferred(context, annotation, kAnnotation); });
}

std::vector<CSpan> AnnotationsWithFields(const CTree& tree) {
    std::vector<CSpan> found;
    if (std::any_of(tree.Line().embedded.begin(), tree.Line().embedded.end(), MayBeWrongInAnnotation))
        ForEachAnnotationBelow(
            tree, [&](const CTreeNode& annotation) { found.push_back(SpanOf(tree, annotation)); });
    return found;
}

void CheckFieldInAnnotation(const CRuleContext& context) {
    CheckDeferred(context, context.tree.fRoot, kAnnotation);
}

namespace {

//   (a)=1    Python 2 has parameters in parentheses, but one name alone can't have a default
void CheckDefaults(const CRuleContext& context, const CTreeNode& list) {
    const CTree& tree = context.tree;
    for (uint32_t i = 0; i + 1 < list.child_count; ++i) {
        const CTreeNode& child = tree.Child(list, i);
        if (!child.Is(ENodeKind::kParameterDef) || !HasTokenAt(tree, list, i + 1, kTokenId_EQUAL)) continue;
        const CTreeNode* const nested = PartsOfParameter(tree, child).nested;
        if (nested != nullptr && !nested->Is(ENodeKind::kDefiningArglist))
            context.Report(ECode::kParenthesizedParameter, child, "parenthesized arg with default");
    }
}

// Those in parentheses have names too.
void CheckNames(const CRuleContext& context, const CTreeNode& parameters, int depth) {
    if (depth > CRuleContext::kMaxDepth) return;
    ForEachParameter(context.tree, parameters, [&](const CParameter& parameter) {
        if (parameter.nested != nullptr) return CheckNames(context, *parameter.nested, depth + 1);
        if (parameter.name == nullptr) return;
        CheckBoundName(context, *parameter.name);
        const std::string_view name = context.tree.Text(*parameter.name);
        if (!context.names.Add(name))
            context.Report(ECode::kRepeatedParameter, *parameter.name,
                           Joined("duplicate argument '", name, "' in function definition"));
    });
}

}  // namespace

void CheckParameters(const CRuleContext& context, const CTreeNode& parameters) {
    context.names.Clear();
    CheckNames(context, parameters, 0);
    if (context.language.IsPython3()) return;
    const bool is_list = !parameters.Is(ENodeKind::kParameters);
    if (is_list || parameters.child_count > 2)
        CheckDefaults(context, is_list ? parameters : context.tree.Child(parameters, 1));
}

void CheckTypeParameters(const CRuleContext& context, const CTreeNode& statement) {
    const CTree& tree = context.tree;
    CNameSet names;
    bool has_default = false;
    for (const CTreeNode& parameter : TypeParametersOf(tree, statement)) {
        const CTreeNode& name = NameOfTypeParameter(tree, parameter);
        const EStars stars = StarsOfTypeParameter(tree, parameter);
        const CTypeParameterParts parts = PartsOfTypeParameter(tree, parameter);
        if (!CheckPartsAreSound(context, name, parts)) continue;
        if (!names.Add(tree.Text(name)))
            context.Report(ECode::kRepeatedTypeParameter, name,
                           Joined("duplicate type parameter '", tree.Text(name), "'"));
        if (has_default && parts.value == nullptr)
            context.Report(
                ECode::kTypeParameterOrder, name,
                Joined("non-default type parameter '", tree.Text(name), "' follows default type parameter"));
        has_default |= parts.value != nullptr;
        if (parts.bound != nullptr) CheckBound(context, *parts.bound, stars);
        if (parts.value != nullptr && parts.value->Is(ENodeKind::kStar) && stars != EStars::kOne)
            context.Report(ECode::kMisplacedStar, *parts.value, "can't use starred expression here");
        if (parts.value != nullptr)
            CheckDeferred(context, *parts.value, Joined("a ", KindOfTypeParameter(stars), " default"));
    }
    CheckScopedStatement(context, TypeParameterScopedStatementOf(tree, statement));
}

}  // namespace codeloom
