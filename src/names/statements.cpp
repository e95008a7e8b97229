// Statements and expressions that bind names by a target, and those that hand a value on.
#include "syntax/statements.h"

#include "names/name_walker.h"
#include "names/record_kinds.h"

namespace codeloom {

void CNameWalker::_VisitFor(const CTreeNode& node) {
    const CForParts parts = PartsOfFor(*_fTree, node);
    _VisitIn(EContext::kStore, *parts.target);
    _VisitNode(*parts.iterable);
    _fTrailer += kIterationSubscript;
    _RecordTargets(*parts.target, parts.iterable);
    _fTrailer.clear();
    _VisitNode(*parts.body);
    if (parts.else_body != nullptr) _VisitNode(*parts.else_body);
}

// The target isn't visited: what one like `x[i]` reads isn't recorded.
void CNameWalker::_VisitWithItem(const CTreeNode& node) {
    const CTreeNode& expression = ExpressionOfWithItem(*_fTree, node);
    _RecordTargets(TargetOfWithItem(*_fTree, node), &expression);
    _VisitNode(expression);
}

void CNameWalker::_VisitExcept(const CTreeNode& node) {
    const CTreeNode* const type = TypeOfExcept(*_fTree, node);
    const CTreeNode* const target = TargetOfExcept(*_fTree, node);
    if (type == nullptr) return;
    _VisitNode(*type);
    if (target == nullptr) return;
    if (!target->Is(ENodeKind::kNameLiteral)) _Fail(EFault::kExceptTarget, *target);
    if (!_IsRecording()) return;
    _RecordTargets(*target, nullptr);
    _RecordInstanceOf(_NumberOfLeaf(*target), SpanOfLeaf(*_fTree, *target), *type);
}

void CNameWalker::_VisitReturn(const CTreeNode& node) {
    const CTreeNode* const value = ExpressionAfterKeyword(*_fTree, node);
    if (value == nullptr) return;
    _VisitNode(*value);
    if (!_IsRecording()) return;
    const CTreeNode& keyword = _fTree->Child(node, 0);
    _AddEquiv(_NumberOfLeaf(keyword), *value, SpanOfLeaf(*_fTree, keyword));
}

// Unlike a `return`, a `yield` of an unknown value is recorded, as an empty equiv. That of a `yield from` is
// a plain one whatever the value.
void CNameWalker::_VisitYield(const CTreeNode& node) {
    const CTreeNode* const value_node = ValueOfYield(*_fTree, node);
    if (value_node == nullptr) return;
    _VisitNode(*value_node);
    if (!_IsRecording()) return;
    const CTreeNode& keyword = _fTree->Child(node, 0);
    const bool is_from = IsYieldFrom(*_fTree, node);
    CTextBuffer& values = _fRecords->values;
    const size_t value = _BeginValue();
    if (is_from) values += "from ";
    const size_t equiv = values.size();
    char kind = _AppendEquiv(*value_node);
    if (is_from && kind != 0 && kind != kPlainEquivKind) _InsertPrefix(equiv, kind);
    if (is_from || kind == 0) kind = kPlainEquivKind;
    _Add(_NumberOfLeaf(keyword), kind, SpanOfLeaf(*_fTree, keyword), value);
}

// The prefix of a record is visible where the payload of another holds it.
void CNameWalker::_InsertPrefix(size_t pos, char kind) {
    CTextBuffer& values = _fRecords->values;
    const size_t start = _fScratch.size();
    _fScratch += values.From(pos);
    values.CutTo(pos);
    ((values += ':') += kind) += ':';
    values += _fScratch.From(start);
    _fScratch.CutTo(start);
}

void CNameWalker::_VisitNamed(const CTreeNode& node) {
    const CTreeNode& value = ValueOfNamed(*_fTree, node);
    _RecordTargets(AssignedNameOf(*_fTree, node), &value);
    _VisitNode(value);
}

void CNameWalker::_VisitCase(const CTreeNode& node) {
    const CTreeNode& pattern = PatternOfCase(*_fTree, node);
    if (pattern.Is(ENodeKind::kPattern)) _VisitPattern(pattern);
    if (const CTreeNode* const guard = GuardOfCase(*_fTree, node)) _VisitNode(*guard);
    if (const CTreeNode* const body = BodyOfCase(*_fTree, node)) _VisitNode(*body);
}

// Captures are bound, values and classes are read.
void CNameWalker::_VisitPattern(const CTreeNode& node) {
    const CNesting nesting(_fNesting);
    std::span<const CTreeNode> parts = _fTree->Children(node);
    if (node.Is(ENodeKind::kClassPattern)) {
        _VisitNode(parts[0]);
        parts = parts.subspan(1);
    } else if (IsNamedPattern(*_fTree, node)) {
        parts = parts.subspan(2);
    }
    for (const CTreeNode& part : parts) {
        if (part.word == EWord::kUnderscore) continue;
        if (part.Is(ENodeKind::kNameLiteral)) {
            if (_IsRecording()) _AddPlain(_NumberOfLeaf(part), kSetKind, SpanOfLeaf(*_fTree, part));
        } else if (part.Is(ENodeKind::kExpression)) {
            _VisitNode(part);
        } else if (part.Is(ENodeKind::kPattern)) {
            _VisitPattern(part);
        }
    }
}

}  // namespace codeloom
