// Statements that bind names by a target, an import, a declaration or a pattern.
#include "syntax/statements.h"

#include <algorithm>

#include "occurrences/occurrence_finder.h"
#include "syntax/imports.h"

namespace codeloom {

// Assignments

void COccurrenceFinder::_VisitExprStmt(const CTreeNode& node) {
    const CTree& tree = *_fTree;
    const CTreeNode& first = tree.Child(node, 0);
    if (const CTreeNode* const annotated = AnnotatedAssignOf(tree, node))
        return _VisitAnnotatedAssign(first, *annotated);
    // In Python 2 any assignment may come after `type`.
    if (tree.Line().type == ELogicalType::kTypeStatement && first.Is(ENodeKind::kNameLiteral)) {
        _Add(first, ERole::kBind);
        return _VisitAlias(first, ValueOfAssignment(tree, node));
    }
    const uint32_t target_count = EqualCountOf(tree, node);
    for (uint32_t i = 0; i < target_count; ++i) _VisitTarget(TargetOf(tree, node, i), ERole::kBind);
    if (target_count == 0) _VisitTarget(first, ERole::kAugment);
    _Visit(ValueOfAssignment(tree, node));
}

void COccurrenceFinder::_VisitAnnotatedAssign(const CTreeNode& target, const CTreeNode& annotated) {
    const CTreeNode* const value = ValueOfAnnotatedAssign(*_fTree, annotated);
    const size_t target_i = _fFound.items.size();
    _VisitTarget(target, ERole::kBind);
    if (target.IsLeaf() && _fFound.items.size() > target_i) {
        _fFound.items[target_i].flags |= COccurrence::kIsAnnotated;
    } else if (target.Is(ENodeKind::kAtom) && value == nullptr) {
        for (size_t i = target_i; i < _fFound.items.size(); ++i)
            if (_fFound.items[i].role == ERole::kBind) _fFound.items[i].flags |= COccurrence::kIsIdle;
    }
    _fAnnotationScope = 0;
    _VisitAnnotation(HintOfAnnotatedAssign(*_fTree, annotated), _fScope);
    if (value != nullptr) _Visit(*value);
}

// Compound statements

void COccurrenceFinder::_VisitFor(const CTreeNode& node) {
    const CForParts parts = PartsOfFor(*_fTree, node);
    _VisitTarget(*parts.target, ERole::kBind);
    _Visit(*parts.iterable);
    _Visit(*parts.body);
    if (parts.else_body != nullptr) _Visit(*parts.else_body);
}

void COccurrenceFinder::_VisitExcept(const CTreeNode& node) {
    if (const CTreeNode* const type = TypeOfExcept(*_fTree, node)) _Visit(*type);
    if (const CTreeNode* const target = TargetOfExcept(*_fTree, node)) _VisitTarget(*target, ERole::kBind);
}

// Imports and declarations

void COccurrenceFinder::_VisitImport(const CTreeNode& node) {
    ForEachImportedName(*_fTree, NamesOfImport(*_fTree, node), [&](const CImportedName& imported) {
        const ERole first_role = imported.as_name != nullptr ? ERole::kOrigin : ERole::kImport;
        if (imported.name->IsLeaf()) {
            _Add(*imported.name, first_role);
        } else {
            _VisitDottedName(*imported.name, first_role, ERole::kOrigin);
        }
        if (imported.as_name != nullptr) _Add(*imported.as_name, ERole::kImport);
    });
}

void COccurrenceFinder::_VisitFromImport(const CTreeNode& node) {
    const CTree& tree = *_fTree;
    bool is_future = false;
    for (const CTreeNode& part : ModuleOfFromImport(tree, node)) {
        if (part.Is(ENodeKind::kDottedName)) {
            _VisitDottedName(part, ERole::kOrigin, ERole::kOrigin);
        } else if (part.Is(ENodeKind::kNameLiteral)) {
            _Add(part, ERole::kOrigin);
            is_future = tree.Text(part) == "__future__";
        }
    }
    if (const CTreeNode* const star = StarOfFromImport(tree, node)) {
        _Add(*star, ERole::kImport);
        return;
    }
    ForEachImportedName(tree, NamesOfFromImport(tree, node), [&](const CImportedName& imported) {
        _Add(*imported.name, imported.as_name != nullptr ? ERole::kOrigin : ERole::kImport);
        if (imported.as_name != nullptr) _Add(*imported.as_name, ERole::kImport);
        _fHasDeferredAnnotations |= is_future && tree.Text(*imported.name) == "annotations";
    });
}

void COccurrenceFinder::_VisitDeclared(const CTreeNode& node, ERole role) {
    ForEachDeclaredName(*_fTree, node, [&](const CTreeNode& name) { _Add(name, role); });
}

// Patterns

void COccurrenceFinder::_VisitCase(const CTreeNode& node) {
    _VisitPattern(PatternOfCase(*_fTree, node));
    for (const CTreeNode& child : _fTree->Children(node).subspan(2)) _Visit(child);
}

// Captures are bound, values and classes are read.
void COccurrenceFinder::_VisitPattern(const CTreeNode& node) {
    if (node.Is(ENodeKind::kNameLiteral)) {
        if (node.word != EWord::kUnderscore && !IsValueWord(node.word)) _Add(node, ERole::kBind);
        return;
    }
    if (!node.Is(ENodeKind::kPattern) || _fDepth >= kMostDepth) return _Visit(node);
    ++_fDepth;
    std::span<const CTreeNode> parts = _fTree->Children(node);
    if (node.Is(ENodeKind::kClassPattern)) {
        _Visit(parts[0]);
        parts = parts.subspan(1);
    } else if (IsNamedPattern(*_fTree, node)) {
        _AddName(parts[0], ERole::kKeyword, 0);
        parts = parts.subspan(2);
    }
    for (const CTreeNode& part : parts) _VisitPattern(part);
    --_fDepth;
}

}  // namespace codeloom
