#include "typing/hint_walker.h"

#include <algorithm>

#include "names/node_text.h"
#include "names/record_kinds.h"
#include "syntax/atoms.h"
#include "syntax/definitions.h"
#include "syntax/statements.h"

namespace codeloom {

namespace {

// No hint is below an expression; statements are below nodes that aren't expressions.
bool MayHoldHints(const CTree& tree, const CTreeNode& root) {
    switch (root.kind) {
        case ENodeKind::kFuncdef:
        case ENodeKind::kExprStmt:
        case ENodeKind::kFor:
        case ENodeKind::kWith:
            return true;
        default:
            break;
    }
    if (root.Is(ENodeKind::kExpression)) return false;
    for (const CTreeNode& child : tree.Children(root))
        if (!child.IsLeaf() && !child.Is(ENodeKind::kExpression)) return true;
    return false;
}

}  // namespace

CHintResult CHintWalker::Walk(const CTree& tree, const CHintContext& context) {
    if (!MayHoldHints(tree, tree.fRoot)) return {};
    _fTree = &tree;
    return _Run(tree.Line(), context, [&] { _VisitNode(tree.fRoot); });
}

CHintResult CHintWalker::WalkComment(const CRawLogical& comment, const CHintContext& context) {
    return _Run(comment, context, [&] {
        const std::optional<uint32_t> token_i = _FindComment(0);
        if (token_i && _ReadHint(*token_i)) _RecordFunction(nullptr);
    });
}

// Runs `visit`, which may end early: with a fault, at a limit, or because it gives up.
template <class Visit>
CHintResult CHintWalker::_Run(const CRawLogical& line, const CHintContext& context, Visit visit) {
    _fLine = &line;
    _fContext = context;
    _fResult = {};
    _fHasMarks.reset();
    _fVisitCount = _fDepth = _fNesting = 0;
    _fArgument_i = -1;
    try {
        visit();
    } catch (const CLimitHit& hit) {
        _NoteLimit(hit.limit);
    } catch (const CHintRefusal& refusal) {
        _fResult.fault = {EFault::kInvalidHint, nullptr, -1, _fHint.token_i, refusal.offset};
    } catch (const CStop&) {
    }
    return _fResult;
}

void CHintWalker::_NoteLimit(ELimit limit) {
    if (_fResult.limit == ELimit::kNone) _fResult.limit = limit;
}

void CHintWalker::_NoteSize(const CTree& tree) {
    _fResult.is_deep |= !_fTreeSize.IsWithin(tree, kMostVisits, kMostDepth);
}

// Visits

void CHintWalker::_VisitNode(const CTreeNode& node) {
    if (++_fVisitCount > kMostVisits) throw CLimitHit{ELimit::kTooManyVisits};
    if (++_fDepth > kMostDepth) throw CLimitHit{ELimit::kTooDeep};
    _VisitInner(node);
    --_fDepth;
}

void CHintWalker::_VisitInner(const CTreeNode& node) {
    switch (node.kind) {
        case ENodeKind::kFuncdef:
            return _VisitFuncdef(node);
        case ENodeKind::kExprStmt:
            return _VisitExprStmt(node);
        case ENodeKind::kFor:
            return _VisitFor(node);
        case ENodeKind::kWith:
            return _VisitWith(node);
        default:
            for (const CTreeNode& child : _fTree->Children(node)) _VisitNode(child);
    }
}

void CHintWalker::_VisitExprStmt(const CTreeNode& node) {
    const CTreeNode& target = _fTree->Child(node, 0);
    if (const CTreeNode* const annotated = AnnotatedAssignOf(*_fTree, node))
        _Pair(target, {{_fTree}, &HintOfAnnotatedAssign(*_fTree, *annotated)});
    if (_CommentsMayHoldHints() && EqualCountOf(*_fTree, node) != 0 && _ReadEndingHint(node))
        _PairComment(target, false);
}

void CHintWalker::_VisitFor(const CTreeNode& node) {
    if (_CommentsMayHoldHints() && _ReadEndingHint(node))
        _PairComment(*PartsOfFor(*_fTree, node).target, false);
}

void CHintWalker::_VisitWith(const CTreeNode& node) {
    if (!_CommentsMayHoldHints() || !_ReadEndingHint(node)) return;
    ForEachWithItem(*_fTree, node,
                    [&](const CTreeNode& item) { _PairComment(TargetOfWithItem(*_fTree, item), false); });
}

void CHintWalker::_VisitFuncdef(const CTreeNode& node) {
    bool has_argument_comments = false;
    CParameter last_without_hint;
    ForEachParameter(*_fTree, ParametersOfFuncdef(*_fTree, node), [&](const CParameter& parameter) {
        last_without_hint = {};
        if (parameter.name == nullptr) return;
        if (parameter.type_expr != nullptr) {
            _Pair(*parameter.name, {{_fTree}, parameter.type_expr, true});
        } else if (_CommentsMayHoldHints() && _PairArgumentComment(parameter)) {
            has_argument_comments = true;
        } else {
            last_without_hint = parameter;
        }
    });
    if (const CTreeNode* const result = ReturnTypeOfFuncdef(*_fTree, node))
        _Record(kReturnName, SpanOf(*_fTree, *ArrowOfFuncdef(*_fTree, node)), {{_fTree}, result, true});
    if (!_CommentsMayHoldHints() || !_ReadEndingHint(node)) return;
    if (has_argument_comments && _IsForArgument(last_without_hint)) {
        _PairComment(*last_without_hint.name, true);
    } else {
        _RecordFunction(&node);
    }
}

// Names and hints

// Tuples are paired item by item; what has no partner is passed over.
void CHintWalker::_Pair(const CTreeNode& name, const CHint& hint) {
    if (!_IsWanted()) return;
    const CItems names = ItemsOf(*_fTree, name);
    if (names.count == 0) return _RecordTarget(name, hint);
    const CNesting nesting(_fNesting);
    const CItems hints = ItemsOf(*hint.tree.tree, *hint.node);
    for (uint32_t i = 0; i < std::min(names.count, hints.count); ++i) {
        const CTreeNode* const one_name = names.At(*_fTree, i);
        const CTreeNode* const one_hint = hints.At(*hint.tree.tree, i);
        if (one_name != nullptr && one_hint != nullptr) _Pair(*one_name, {hint.tree, one_hint, hint.of_arg});
    }
}

void CHintWalker::_RecordTarget(const CTreeNode& target, const CHint& hint) {
    _fName.clear();
    if (CNodeText(*_fTree).AppendDottedName(target, _fName))
        _Record(_fName.View(), SpanOf(*_fTree, DropParentheses(*_fTree, target)), hint);
}

void CHintWalker::_Record(std::string_view name, CSpan place, const CHint& hint) {
    if (_fContext.observer != nullptr && _fContext.observer->WantsHints()) _Tell(name, place, hint);
    if (_fContext.records == nullptr) return;
    CRecords& records = *_fContext.records;
    const size_t value = records.values.size();
    const CTree& tree = *hint.tree.tree;
    if (hint.node->Is(ENodeKind::kStringLiteral)) {
        records.values += ContentsOfString(tree.Text(*hint.node));
    } else {
        CNodeText(tree, ECallText::kBare).Append(*hint.node, records.values);
    }
    records.records.push_back({records.names->Number(name), static_cast<uint32_t>(value),
                               static_cast<uint32_t>(records.values.size() - value), place.start, place.end,
                               kTypeHintKind, hint.of_arg});
}

bool CHintWalker::_IsWanted() const {
    return _fContext.records != nullptr ||
           (_fContext.observer != nullptr && _fContext.observer->WantsHints());
}

void CHintWalker::_Tell(std::string_view name, CSpan place, const CHint& hint) {
    const bool is_return = name == kReturnName, has_index = _fArgument_i >= 0;
    _fContext.observer->TakeHintOf({place, _PlaceOf(hint), hint.of_arg || is_return || has_index, is_return,
                                    hint.tree.tree != _fTree, is_return ? -1 : _fArgument_i});
}

}  // namespace codeloom
