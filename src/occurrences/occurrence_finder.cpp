#include "occurrences/occurrence_finder.h"

#include <algorithm>
#include <utility>

#include "syntax/definitions.h"
#include "syntax/statements.h"

namespace codeloom {

namespace {

constexpr ERole AttributeRoleOf(ERole role) {
    switch (role) {
        case ERole::kBind:
            return ERole::kAttributeBind;
        case ERole::kAugment:
            return ERole::kAttributeAugment;
        case ERole::kDelete:
            return ERole::kAttributeDelete;
        default:
            return ERole::kAttribute;
    }
}

uint8_t FlagOf(ELogicalType type) {
    if (type == ELogicalType::kFstringFieldExp) return COccurrence::kInField;
    return type == ELogicalType::kStringifiedTypeHint ? COccurrence::kInQuotes : 0;
}

}  // namespace

// Lines

void COccurrenceFinder::BeginLine(const CRawLogical& line) {
    _fFirstItem = _fFound.items.size();
    _fFirstScope = _fFound.scopes.size();
    _fOpenedScope = 0;
    _fLine = &line;
    _fHasEmbedded = _fHasParts = !line.embedded.empty();
    _fStrings.clear();
}

void COccurrenceFinder::Take(const CRawLogical& part, const CTree& tree) {
    if (tree.fIsEmpty) return;
    _fTree = &tree;
    _fScope = _fShift = 0;
    _fFlags = FlagOf(part.type);
    _fBracket = 0;
    _fAnnotationScope = 0;
    if (&part != _fLine) {
        const uint32_t start = part.StartOf(part.tokens.front());
        const auto around = std::find_if(_fStrings.rbegin(), _fStrings.rend(), [&](const CString& string) {
            return string.start <= start && start < string.end;
        });
        if (around != _fStrings.rend()) {
            _fScope = around->scope;
            _fFlags |= around->flags;
        }
        if ((_fFlags & COccurrence::kInQuotes) != 0 && !_IsInAnnotation(_fScope))
            _fScope = _AddAnnotationScope(_fScope, tree.fRoot, true);
    }
    _Visit(tree.fRoot);
}

void COccurrenceFinder::TakeHint(const CTree& tree, const CTreeNode& node, uint32_t shift) {
    _fTree = &tree;
    _fHasParts = true;
    _fFlags = COccurrence::kInComment;
    _fShift = shift;
    _fScope = 0;
    _fScope = _AddAnnotationScope(0, node, true);
    const bool has_embedded = std::exchange(_fHasEmbedded, false);
    _Visit(node);
    _fHasEmbedded = has_embedded;
}

void COccurrenceFinder::EndLine(bool has_fault) {
    if (has_fault) {
        _fFound.items.CutTo(_fFirstItem);
        _fFound.scopes.CutTo(_fFirstScope);
        _fOpenedScope = 0;
        return;
    }
    if (!_fHasParts) return;
    COccurrence* const first = _fFound.items.begin() + _fFirstItem;
    const auto is_before = [](const COccurrence& one, const COccurrence& other) {
        return one.start < other.start;
    };
    if (!std::is_sorted(first, _fFound.items.end(), is_before))
        std::stable_sort(first, _fFound.items.end(), is_before);
}

// Nodes

void COccurrenceFinder::_VisitInner(const CTreeNode& node) {
    if (_fDepth >= kMostDepth) return;
    ++_fDepth;
    _Dispatch(node);
    --_fDepth;
}

void COccurrenceFinder::_VisitChildren(const CTreeNode& node) {
    for (const CTreeNode& child : _fTree->Children(node))
        if (!child.IsLeaf() || child.Is(ENodeKind::kExpression)) _Visit(child);  // most leaves are signs
}

void COccurrenceFinder::_VisitIn(uint32_t scope, const CTreeNode& node) {
    const uint32_t outer = std::exchange(_fScope, scope);
    _Visit(node);
    _fScope = outer;
}

inline void COccurrenceFinder::_Dispatch(const CTreeNode& node) {
    const CTree& tree = *_fTree;
    switch (node.kind) {
        case ENodeKind::kAtomExpr:
            return _VisitChain(ChainOfAtomExpr(tree, node), ERole::kRead);
        case ENodeKind::kPower:
            _VisitChain(ChainOfPower(tree, node), ERole::kRead);
            if (const CTreeNode* const exponent = ExponentOf(tree, node)) _Visit(*exponent);
            return;
        case ENodeKind::kExprStmt:
            return _VisitExprStmt(node);
        case ENodeKind::kUsedArgument:
            return _VisitArgument(node);
        case ENodeKind::kTestList:
        case ENodeKind::kListmaker:
        case ENodeKind::kNode:
            if (!_VisitComprehension(node)) _VisitChildren(node);
            return;
        case ENodeKind::kAtom:
            _fBracket = static_cast<int16_t>(tree.Child(node, 0).symbol);
            return _VisitChildren(node);
        case ENodeKind::kNamedExpr:
            _AddName(AssignedNameOf(tree, node), ERole::kBind, COccurrence::kIsWalrus);
            return _Visit(ValueOfNamed(tree, node));
        case ENodeKind::kLambda:
            return _VisitLambda(node);
        case ENodeKind::kFuncdef:
            return _VisitFuncdef(node, _fScope);
        case ENodeKind::kClassdef:
            return _VisitClassdef(node, _fScope);
        case ENodeKind::kWithTypeParameters:
            return _VisitGeneric(node);
        case ENodeKind::kExpression:
        case ENodeKind::kDottedName:
            return _VisitDottedName(node, ERole::kRead, ERole::kAttribute);
        case ENodeKind::kFor:
            return _VisitFor(node);
        case ENodeKind::kWithItem:
            _Visit(ExpressionOfWithItem(tree, node));
            return _VisitTarget(TargetOfWithItem(tree, node), ERole::kBind);
        case ENodeKind::kExceptClause:
            return _VisitExcept(node);
        case ENodeKind::kDel:
            return _VisitTarget(*ExpressionAfterKeyword(tree, node), ERole::kDelete);
        case ENodeKind::kImportNames:
            return _VisitImport(node);
        case ENodeKind::kFromImport:
            return _VisitFromImport(node);
        case ENodeKind::kGlobal:
            return _VisitDeclared(node, ERole::kGlobal);
        case ENodeKind::kNonlocal:
            return _VisitDeclared(node, ERole::kNonlocal);
        case ENodeKind::kMatch:
            return _Visit(SubjectOfMatch(tree, node));
        case ENodeKind::kCase:
            return _VisitCase(node);
        default:
            return _VisitChildren(node);
    }
}

// `f(a=1)`, `f(a := 1)`, `f(*a)`, `f(a for a in b)`
void COccurrenceFinder::_VisitArgument(const CTreeNode& node) {
    if (IsNamedArgument(*_fTree, node)) {
        const CTreeNode& name = _fTree->Child(node, 0);
        name.Is(ENodeKind::kNameLiteral) ? void(_Add(name, ERole::kKeyword)) : _Visit(name);
        return _Visit(_fTree->Child(node, 2));
    }
    if (IsAssigningArgument(*_fTree, node)) {
        _AddName(AssignedNameOf(*_fTree, node), ERole::kBind, COccurrence::kIsWalrus);
        return _Visit(ValueOfNamed(*_fTree, node));
    }
    _fBracket = kTokenId_LPAR;
    if (!_VisitComprehension(node)) _VisitChildren(node);
}

// Chains

// `a.b(1)[2]`, whose last name may be a target's.
void COccurrenceFinder::_VisitChain(const CChain& chain, ERole last_role) {
    if (chain.trailers.empty()) return _VisitTarget(*chain.atom, last_role);
    _Visit(*chain.atom);
    const CSpan atom = chain.atom->IsLeaf() ? SpanOfLeaf(*_fTree, *chain.atom) : SpanOf(*_fTree, *chain.atom);
    const uint32_t start = atom.start + _fShift;
    uint32_t end = atom.end + _fShift;
    for (const CTreeNode& trailer : chain.trailers) {
        const CTreeNode& last = LastChild(*_fTree, trailer);
        if (HasTokenAt(*_fTree, trailer, 0, kTokenId_DOT)) {
            const bool is_last = &trailer == &chain.trailers.back();
            _AddAttribute(last, is_last ? AttributeRoleOf(last_role) : ERole::kAttribute, start, end);
        } else if (const CTreeNode* const contents = ContentsOfTrailer(*_fTree, trailer)) {
            _Visit(*contents);
        }
        end = SpanOfLeaf(*_fTree, last).end + _fShift;
    }
}

// `a.b.c`
//   child    name  '.'  name  '.'  name
void COccurrenceFinder::_VisitDottedName(const CTreeNode& node, ERole first_role, ERole next_role) {
    const std::span<const CTreeNode> children = _fTree->Children(node);
    if (!children[0].Is(ENodeKind::kNameLiteral)) return _VisitChildren(node);
    const COccurrence first = _Add(children[0], first_role);
    uint32_t end = first.end;
    for (size_t i = 2; i < children.size(); i += 2)
        end = _AddAttribute(children[i], next_role, first.start, end).end;
}

// Targets

void COccurrenceFinder::_VisitTarget(const CTreeNode& node, ERole role) {
    if (role == ERole::kRead) return _Visit(node);
    if (node.IsLeaf()) {
        if (node.Is(ENodeKind::kNameLiteral) && !_IsValue(node)) _Add(node, role);
        return;
    }
    if (_fDepth >= kMostDepth) return;
    ++_fDepth;
    switch (node.kind) {
        case ENodeKind::kAtomExpr:
        case ENodeKind::kPower:
            _VisitChain(ChainOf(*_fTree, node), role);
            break;
        case ENodeKind::kAtom:
        case ENodeKind::kTestList:
        case ENodeKind::kListmaker:
        case ENodeKind::kStar:
        case ENodeKind::kNode:
            _VisitTargetAtom(node, role);
            break;
        default:
            _Visit(node);
    }
    --_fDepth;
}

// What holds targets: brackets, a list of them, a star. Anything else there isn't a target.
void COccurrenceFinder::_VisitTargetAtom(const CTreeNode& node, ERole role) {
    if (node.Is(ENodeKind::kAtom)) _fBracket = static_cast<int16_t>(_fTree->Child(node, 0).symbol);
    if (_VisitComprehension(node)) return;
    for (const CTreeNode& child : _fTree->Children(node)) _VisitTarget(child, role);
}

// Adding

bool COccurrenceFinder::_IsValue(const CTreeNode& name) const {
    if (!IsValueWord(name.word)) return false;
    return _fLanguage.IsPython3() || name.word == EWord::kNoneValue;
}

COccurrence& COccurrenceFinder::_Add(const CTreeNode& leaf, ERole role) {
    const CRawToken& token = _fTree->Token(leaf);
    const uint32_t name = _fFound.names->Number(_fTree->Line().Text(token)), start = token.start + _fShift;
    return _fFound.items.push_back({name, start, start + token.length, 0, 0, _fScope, role, _fFlags});
}

void COccurrenceFinder::_AddName(const CTreeNode& node, ERole role, uint8_t flags) {
    if (!node.Is(ENodeKind::kNameLiteral)) return _Visit(node);
    _Add(node, role).flags |= flags;
}

COccurrence& COccurrenceFinder::_AddAttribute(const CTreeNode& leaf, ERole role, uint32_t object_start,
                                              uint32_t object_end) {
    COccurrence& added = _Add(leaf, role);
    added.object_start = object_start;
    added.object_end = object_end;
    return added;
}

// Expressions within the literal are read where the literal is.
void COccurrenceFinder::_NoteString(const CTreeNode& leaf) {
    const CSpan span = SpanOfLeaf(*_fTree, leaf);
    _fStrings.push_back({span.start, span.end, _fScope, _fFlags});
}

}  // namespace codeloom
