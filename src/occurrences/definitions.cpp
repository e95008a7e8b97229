// What opens a scope within a line, or for the block after it.
#include "syntax/definitions.h"

#include <utility>

#include "occurrences/occurrence_finder.h"
#include "syntax/atoms.h"

namespace codeloom {

namespace {

constexpr int kDefersAnnotations = 314;  // PEP 649

}  // namespace

uint32_t COccurrenceFinder::_AddScope(EScopeKind kind, uint32_t name, uint32_t parent,
                                      const CTreeNode& node) {
    const CSpan span = SpanOf(*_fTree, node);
    _fFound.scopes.push_back(
        {kind, false, false, false, name, parent, span.start + _fShift, span.end + _fShift});
    return static_cast<uint32_t>(_fFound.scopes.size() - _fFirstScope);
}

uint32_t COccurrenceFinder::_AddAnnotationScope(uint32_t parent, const CTreeNode& node, bool is_text) {
    const uint32_t scope = _AddScope(EScopeKind::kAnnotation, _fNoName, parent, node);
    _fFound.scopes.back().is_text = is_text;
    return scope;
}

// Functions

// `header_scope` is that of type parameters, or the one around. Defaults belong to the one around.
void COccurrenceFinder::_VisitFuncdef(const CTreeNode& node, uint32_t header_scope) {
    const CTree& tree = *_fTree;
    const CTreeNode& name = NameOfFuncdef(tree, node);
    if (header_scope == _fScope) _AddName(name, ERole::kBind, COccurrence::kIsDefinition);
    const uint32_t scope = _AddScope(EScopeKind::kFunction, _NumberOf(name), header_scope, node);
    _fOpenedScope = scope;
    _fAnnotationScope = 0;
    _VisitParameters(ParametersOfFuncdef(tree, node), scope, header_scope);
    if (const CTreeNode* const result = ReturnTypeOfFuncdef(tree, node))
        _VisitAnnotation(*result, header_scope);
    _VisitIn(scope, SuiteOfDefinition(tree, node));
}

void COccurrenceFinder::_VisitParameters(const CTreeNode& node, uint32_t scope, uint32_t header_scope) {
    if (_fDepth >= kMostDepth) return;
    ++_fDepth;
    ForEachParameter(*_fTree, node, [&](const CParameter& parameter) {
        if (parameter.nested != nullptr) return _VisitParameters(*parameter.nested, scope, header_scope);
        if (parameter.name == nullptr) return;
        _Add(*parameter.name, ERole::kParameter).scope = scope;
        if (parameter.type_expr != nullptr) _VisitAnnotation(*parameter.type_expr, header_scope);
        if (parameter.value != nullptr) _Visit(*parameter.value);
    });
    --_fDepth;
}

void COccurrenceFinder::_VisitLambda(const CTreeNode& node) {
    const uint32_t scope = _AddScope(EScopeKind::kLambda, _fNoName, _fScope, node);
    if (const CTreeNode* const parameters = ParametersOfLambda(*_fTree, node))
        _VisitParameters(*parameters, scope, _fScope);
    _VisitIn(scope, BodyOfLambda(*_fTree, node));
}

// Annotations are evaluated where they are, or later in a scope of their own.
void COccurrenceFinder::_VisitAnnotation(const CTreeNode& node, uint32_t header_scope) {
    if (!_DefersAnnotations()) return _VisitIn(header_scope, node);
    if (_fAnnotationScope == 0)
        _fAnnotationScope = _AddAnnotationScope(header_scope, node, _fHasDeferredAnnotations);
    const uint32_t scope = _fAnnotationScope;
    _VisitIn(scope, node);
    CInnerScope& added = _fFound.scopes[_fFirstScope + scope - 1];
    added.end = SpanOf(*_fTree, node).end;
}

bool COccurrenceFinder::_DefersAnnotations() const {
    return _fHasDeferredAnnotations || _fLanguage.version >= kDefersAnnotations;
}

bool COccurrenceFinder::_IsInAnnotation(uint32_t scope) const {
    return scope != 0 && _fFound.scopes[_fFirstScope + scope - 1].kind == EScopeKind::kAnnotation;
}

// Classes and type parameters

void COccurrenceFinder::_VisitClassdef(const CTreeNode& node, uint32_t header_scope) {
    const CTree& tree = *_fTree;
    const CTreeNode& name = NameOfClassdef(tree, node);
    if (header_scope == _fScope) _AddName(name, ERole::kBind, COccurrence::kIsDefinition);
    if (const CTreeNode* const bases = BasesOfClassdef(tree, node)) _VisitIn(header_scope, *bases);
    const uint32_t scope = _AddScope(EScopeKind::kClass, _NumberOf(name), header_scope, node);
    _fOpenedScope = scope;
    _VisitIn(scope, SuiteOfDefinition(tree, node));
}

// A definition or an alias with type parameters, whose name comes before them.
void COccurrenceFinder::_VisitGeneric(const CTreeNode& node) {
    const CTree& tree = *_fTree;
    const CTreeNode* statement = &TypeParameterScopedStatementOf(tree, node);
    // `async def`
    if (!statement->Is(ENodeKind::kStmt) && !statement->IsLeaf()) statement = &LastChild(tree, *statement);
    const bool is_alias = statement->Is(ENodeKind::kExprStmt);
    // Python 2 has neither, so that any statement may come after `type name`.
    if (!is_alias && !statement->Is(ENodeKind::kFuncdef) && !statement->Is(ENodeKind::kClassdef))
        return _VisitChildren(node);
    const CTreeNode& name = tree.Child(*statement, is_alias ? 0 : 1);
    _AddName(name, ERole::kBind, is_alias ? 0 : COccurrence::kIsDefinition);
    const uint32_t scope = _AddScope(EScopeKind::kTypeParameters, _NumberOf(name), _fScope, node);
    _fFound.scopes.back().is_of_class = statement->Is(ENodeKind::kClassdef);
    for (const CTreeNode& parameter : TypeParametersOf(tree, node)) _VisitTypeParameter(parameter, scope);
    if (statement->Is(ENodeKind::kFuncdef)) return _VisitFuncdef(*statement, scope);
    if (statement->Is(ENodeKind::kClassdef)) return _VisitClassdef(*statement, scope);
    const uint32_t outer = std::exchange(_fScope, scope);
    _VisitAlias(name, LastChild(tree, *statement));
    _fScope = outer;
}

void COccurrenceFinder::_VisitTypeParameter(const CTreeNode& node, uint32_t scope) {
    const CTree& tree = *_fTree;
    const CTreeNode& name = NameOfTypeParameter(tree, node);
    const uint32_t outer = std::exchange(_fScope, scope);
    _AddName(name, ERole::kTypeParameter, 0);
    if (const CTreeNode* const spec = SpecOfTypeParameter(tree, node)) {
        const bool has_both = spec->kind == ENodeKind::kNode && HasTokenAt(tree, *spec, 1, kTokenId_EQUAL);
        _VisitTypeVariable(name, has_both ? tree.Child(*spec, 0) : *spec);
        if (has_both) _VisitTypeVariable(name, LastChild(tree, *spec));
    }
    _fScope = outer;
}

// The bound or the default of a type parameter.
void COccurrenceFinder::_VisitTypeVariable(const CTreeNode& name, const CTreeNode& spec) {
    _VisitIn(_AddScope(EScopeKind::kTypeVariable, _NumberOf(name), _fScope, spec), spec);
}

void COccurrenceFinder::_VisitAlias(const CTreeNode& name, const CTreeNode& value) {
    _VisitIn(_AddScope(EScopeKind::kTypeAlias, _NumberOf(name), _fScope, value), value);
}

// Comprehensions

EScopeKind COccurrenceFinder::_ComprehensionKind(const CTreeNode& owner) const {
    if (_fBracket == kTokenId_LSQB) return EScopeKind::kListComprehension;
    if (_fBracket != kTokenId_LBRACE) return EScopeKind::kGenerator;
    const bool is_dict =
        HasTokenAt(*_fTree, owner, 1, kTokenId_COLON) || HasTokenAt(*_fTree, owner, 0, kTokenId_DOUBLESTAR);
    return is_dict ? EScopeKind::kDictComprehension : EScopeKind::kSetComprehension;
}

// The element and the clauses after it; false where `owner` isn't such. The first iterable belongs outside,
// and the whole comprehension for a list of Python 2.
bool COccurrenceFinder::_VisitComprehension(const CTreeNode& owner) {
    const CTreeNode& last = LastChild(*_fTree, owner);
    if (!last.Is(ENodeKind::kCompFor)) return false;
    const EScopeKind kind = _ComprehensionKind(owner);
    const uint32_t outer = _fScope;
    const bool has_scope = _fLanguage.IsPython3() || kind != EScopeKind::kListComprehension;
    if (has_scope) _fScope = _AddScope(kind, _fNoName, outer, owner);
    for (const CTreeNode& child : _fTree->Children(owner).first(owner.child_count - 1)) _Visit(child);
    _VisitClauses(last, outer);
    _fScope = outer;
    return true;
}

void COccurrenceFinder::_VisitClauses(const CTreeNode& first, uint32_t outer_scope) {
    for (const CTreeNode* clause = &first; clause != nullptr;) {
        if (!clause->Is(ENodeKind::kCompFor)) {
            // `if`
            _Visit(_fTree->Child(*clause, 1));
            clause = TryChild(*_fTree, *clause, 2);
            continue;
        }
        const CCompClause parts = CompClauseOf(*_fTree, *clause);
        _VisitTarget(*parts.target, ERole::kBind);
        _VisitIn(clause == &first ? outer_scope : _fScope, *parts.iterable);
        clause = parts.next;
    }
}

}  // namespace codeloom
