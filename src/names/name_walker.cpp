#include "names/name_walker.h"

#include "names/record_kinds.h"

namespace codeloom {

namespace {

// Thrown where a fault is found, and caught where the walk began.
struct CFaultFound {
    CFault fault;
};

bool MayHaveFault(const CTree& tree) {
    const bool may_have_bare_generator =
        tree.HasKind(ENodeKind::kUsedArgument) && tree.HasKind(ENodeKind::kCompFor);
    return may_have_bare_generator || tree.HasKind(ENodeKind::kExceptClause);
}

}  // namespace

CWalkResult CNameWalker::Walk(const CTree& tree, const CTreeNode& node, CRecords* records) {
    CWalkResult result;
    if (tree.fIsEmpty) return result;
    if (records == nullptr) {
        const bool may_hit_limit = !_fTreeSize.IsWithin(tree, kMostVisits, kMostDepth);
        if (!may_hit_limit && !MayHaveFault(tree)) return result;
        // What nests deeper hits a limit for its records only.
        if (may_hit_limit && !_fTreeSize.IsWithin(tree, UINT32_MAX, kMostNesting))
            records = &(_fUnwanted = CRecords());
    }
    _fTree = &tree;
    _fRecords = records;
    _fContext = EContext::kLoad;
    _fVisitCount = _fDepth = _fNesting = 0;
    _fScratch.clear();
    _fTrailer.clear();
    _fNotes.BeginLine();
    try {
        _VisitNode(node);
        if (_IsRecording()) _RecordNotes();
    } catch (const CLimitHit& hit) {
        result.limit = hit.limit;
    } catch (const CFaultFound& found) {
        result.fault = found.fault;
    }
    return result;
}

void CNameWalker::_RecordNotes() {
    for (const CNameNotes::CLoad& load : _fNotes.Loads()) _AddPlain(load.name, kGetKind, load.place);
    for (const CNameNotes::CStore& store : _fNotes.SortedStores()) {
        const size_t value = _BeginValue();
        _fRecords->values += std::to_string(store.token);
        _Add(store.name, kWithinExprKind, store.place, value);
    }
}

// Visits

void CNameWalker::_VisitInner(const CTreeNode& node) {
    ++_fDepth;
    _Dispatch(node);
    --_fDepth;
}

void CNameWalker::_VisitChildren(const CTreeNode& node) {
    for (const CTreeNode& child : _fTree->Children(node)) _VisitNode(child);
}

void CNameWalker::_VisitIn(EContext context, const CTreeNode& node) {
    const EContext outer = _fContext;
    _fContext = context;
    _VisitNode(node);
    _fContext = outer;
}

inline void CNameWalker::_Dispatch(const CTreeNode& node) {
    switch (node.kind) {
        case ENodeKind::kAtomExpr:
            return _VisitChain(ChainOfAtomExpr(*_fTree, node));
        case ENodeKind::kPower:
            return _VisitPower(node);
        case ENodeKind::kExprStmt:
            return _VisitExprStmt(node);
        case ENodeKind::kUsedArgument:
            return IsAssigningArgument(*_fTree, node) ? _VisitNamed(node) : _VisitChildren(node);
        case ENodeKind::kCompFor:
            return _VisitCompFor(node);
        case ENodeKind::kReturn:
            return _VisitReturn(node);
        case ENodeKind::kFuncdef:
            return _VisitFuncdef(node);
        case ENodeKind::kClassdef:
            return _VisitClassdef(node);
        case ENodeKind::kImportNames:
            return _VisitImport(node);
        case ENodeKind::kFromImport:
            return _VisitFromImport(node);
        case ENodeKind::kFor:
            return _VisitFor(node);
        case ENodeKind::kWithItem:
            return _VisitWithItem(node);
        case ENodeKind::kExceptClause:
            return _VisitExcept(node);
        case ENodeKind::kLambda:
            return _VisitLambda(node);
        case ENodeKind::kYield:
            return _VisitYield(node);
        case ENodeKind::kNamedExpr:
            return _VisitNamed(node);
        case ENodeKind::kSingleDecorator:
            return _VisitDecorator(node);
        case ENodeKind::kDottedName:
            return _VisitDottedName(node);
        case ENodeKind::kGlobal:
            return _RecordDeclared(node, kGlobalKind);
        case ENodeKind::kNonlocal:
            return _RecordDeclared(node, kNonlocalKind);
        case ENodeKind::kMatch:
            return _VisitNode(_fTree->Child(node, 1));
        case ENodeKind::kCase:
            return _VisitCase(node);
        case ENodeKind::kTypeParameter:
            return _VisitTypeParameter(node);
        default:
            return _VisitChildren(node);
    }
}

void CNameWalker::_Fail(EFault kind, const CTreeNode& node) {
    CFault fault;
    fault.kind = kind;
    fault.token_i = node.token;
    throw CFaultFound{fault};
}

// Records

void CNameWalker::_Add(uint32_t name, char kind, CSpan place, size_t value, bool of_arg) {
    const size_t length = _fRecords->values.size() - value;
    _fRecords->records.push_back({name, static_cast<uint32_t>(value), static_cast<uint32_t>(length),
                                  place.start, place.end, kind, of_arg});
}

void CNameWalker::_AddEquiv(uint32_t name, const CTreeNode& node, CSpan place, bool of_arg) {
    const size_t value = _BeginValue();
    if (const char kind = _AppendEquiv(node); kind != 0) _Add(name, kind, place, value, of_arg);
}

uint32_t CNameWalker::_Number(std::string_view name) {
    return _fRecords->names->Number(name);
}

// The number of the text of a node of any kind.
uint32_t CNameWalker::_NumberOfText(const CTreeNode& node) {
    if (node.Is(ENodeKind::kNameLiteral)) return _NumberOfLeaf(node);
    const size_t start = _fScratch.size();
    CNodeText(*_fTree).Append(node, _fScratch);
    const uint32_t number = _Number(_fScratch.From(start));
    _fScratch.CutTo(start);
    return number;
}

}  // namespace codeloom
