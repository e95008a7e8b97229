// Assignments: which name receives what.
#include "names/name_walker.h"
#include "names/record_kinds.h"
#include "syntax/statements.h"

namespace codeloom {

namespace {

// A comma list, or brackets that may hold one.
bool MayHaveItems(const CTreeNode& node) {
    return node.Is(ENodeKind::kTestList) || node.Is(ENodeKind::kAtom);
}

}  // namespace

void CNameWalker::_VisitExprStmt(const CTreeNode& node) {
    if (const CTreeNode* const annotated = AnnotatedAssignOf(*_fTree, node))
        return _VisitAnnotatedAssign(node, *annotated);
    const uint32_t target_count = EqualCountOf(*_fTree, node);
    if (target_count == 0) return _VisitChildren(node);
    _VisitAssignment(node, target_count);
}

void CNameWalker::_VisitAssignment(const CTreeNode& node, uint32_t target_count) {
    const CTreeNode& value = ValueOfAssignment(*_fTree, node);
    for (uint32_t i = 0; i < target_count; ++i) {
        const CTreeNode& target = TargetOf(*_fTree, node, i);
        _RecordTargets(target, &value);
        _VisitIn(EContext::kStore, target);
    }
    _VisitNode(value);
}

void CNameWalker::_VisitAnnotatedAssign(const CTreeNode& node, const CTreeNode& annotated) {
    const CTreeNode& target = _fTree->Child(node, 0);
    _VisitIn(EContext::kStore, target);
    _VisitNode(annotated);
    if (const CTreeNode* const value = ValueOfAnnotatedAssign(*_fTree, annotated))
        _RecordTargets(target, value);
}

// Pairs the names of a target with what they receive of `value`, be it ((a, b), c) = ... or a, *b = ...
void CNameWalker::_RecordTargets(const CTreeNode& target, const CTreeNode* value) {
    if (!_IsRecording()) return;
    MayHaveItems(target) ? _RecordItems(target, value) : _RecordTarget(target, value);
}

// Once a trailer is in force, the right side isn't taken apart any more. After a starred target positions
// aren't corrected.
void CNameWalker::_RecordItems(const CTreeNode& target, const CTreeNode* value) {
    const CNesting nesting(_fNesting);
    const CItems targets = ItemsOf(*_fTree, target);
    CItems values;
    if (value != nullptr && MayHaveItems(*value) && _fTrailer.empty()) values = ItemsOf(*_fTree, *value);
    const size_t trailer_end = _fTrailer.size();
    for (uint32_t i = 0; i < targets.count; ++i) {
        const CTreeNode* const item = targets.At(*_fTree, i);
        if (item == nullptr) continue;
        const CTreeNode* const paired = i < values.count ? values.At(*_fTree, i) : nullptr;
        if (item->Is(ENodeKind::kStar)) {
            _RecordStarredTarget(StarredExpressionOf(*_fTree, *item));
        } else if (paired != nullptr) {
            _RecordTargets(*item, paired);
        } else {
            ((_fTrailer += '[') += std::to_string(i)) += ']';
            _RecordTargets(*item, value);
            _fTrailer.CutTo(trailer_end);
        }
    }
}

// An assignment to `x[i]` defines nothing, yet its value is recorded under that text.
void CNameWalker::_RecordTarget(const CTreeNode& target, const CTreeNode* value) {
    const uint32_t name = _NumberOfText(target);
    const CSpan place = SpanOf(*_fTree, target);
    const bool has_bracket =
        !target.IsLeaf() && _fRecords->names->Text(name).find('[') != std::string_view::npos;
    if (!has_bracket) _AddPlain(name, kSetKind, place);
    if (value != nullptr) _AddEquiv(name, *value, place);
}

// A list, whatever the right side could say.
void CNameWalker::_RecordStarredTarget(const CTreeNode& starred) {
    const CTreeNode& shown = DropParentheses(*_fTree, starred);
    const uint32_t name = _NumberOfText(shown);
    const CSpan place = SpanOf(*_fTree, shown);
    _AddPlain(name, kSetKind, place);
    const size_t value = _BeginValue();
    const char kind = _AppendLiteral("list");
    _Add(name, kind, place, value);
}

}  // namespace codeloom
