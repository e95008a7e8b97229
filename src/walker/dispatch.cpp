#include "walker/dispatch.h"

#include <array>
#include <cstdint>

namespace codeloom {

namespace {

// Calls an operation that takes its node as a Node; by then the node is known to be one.
template <class Node, void (CNodeWalker::*operation)(Node&)>
void Visit(CNodeWalker& walker, CNode& node) {
    (walker.*operation)(static_cast<Node&>(node));
}

void VisitName(CNodeWalker& walker, CNode& node) {
    walker._VisitNameLiteral(static_cast<CNameLiteral&>(node));
}

void VisitAny(CNodeWalker& walker, CNode& node) {
    walker._VisitChildren(node);
}

// `f(a := b)` has the walrus in the argument's own node.
void VisitArgument(CNodeWalker& walker, CNode& node) {
    if (static_cast<CSingleUsedArgumentNode&>(node).GetNameAssigned()) return walker._VisitNamedExpr(node);
    walker._VisitChildren(node);
}

template <class Node>
bool IsA(const CNode& node) {
    return node.As<Node>() != nullptr;
}

struct CDispatchRow {
    bool (*is_instance)(const CNode& node);
    CVisit visit;
};

template <class Node, void (CNodeWalker::*operation)(Node&)>
constexpr CDispatchRow kRow{&IsA<Node>, &Visit<Node, operation>};

// The first row whose class a node is an instance of takes it; a subclass goes with its base.
constexpr CDispatchRow kDispatchOrder[] = {
    kRow<CWithItem, &CNodeWalker::_VisitWithItem>,
    kRow<CImportNamesStmt, &CNodeWalker::_VisitImportNames>,
    kRow<CFromImportStmt, &CNodeWalker::_VisitFromImport>,
    kRow<CExprStmt, &CNodeWalker::_VisitExprStmt>,
    kRow<CForStmt, &CNodeWalker::_VisitForStmt>,
    kRow<CFuncdefStmt, &CNodeWalker::_VisitFuncdef>,
    kRow<CReturnStmt, &CNodeWalker::_VisitReturn>,
    kRow<CClassdefStmt, &CNodeWalker::_VisitClassdef>,
    kRow<CLambdaExpr, &CNodeWalker::_VisitLambdaExpr>,
    kRow<CGlobalStmt, &CNodeWalker::_VisitGlobalStmt>,
    kRow<CNonlocalStmt, &CNodeWalker::_VisitNonlocalStmt>,
    kRow<CPower, &CNodeWalker::_VisitPower>,
    kRow<CAtomExpr, &CNodeWalker::_VisitAtomExpr>,
    {&IsA<CNameLiteral>, &VisitName},
    kRow<CCompForNode, &CNodeWalker::_VisitCompForNode>,
    kRow<CSingleDecorator, &CNodeWalker::_VisitSingleDecorator>,
    kRow<CDottedName, &CNodeWalker::_VisitDottedName>,
    kRow<CExceptClause, &CNodeWalker::_VisitExceptClause>,
    kRow<CYieldExpr, &CNodeWalker::_VisitYield>,
    {&IsA<CNamedExpr>, &Visit<CNode, &CNodeWalker::_VisitNamedExpr>},
    kRow<CMatchStmt, &CNodeWalker::_VisitMatchStmt>,
    kRow<CCaseStmt, &CNodeWalker::_VisitCaseStmt>,
    {&IsA<CSingleUsedArgumentNode>, &VisitArgument},
    kRow<CTypeParameter, &CNodeWalker::_VisitTypeParameter>,
    {&IsA<CNode>, &VisitAny},
};

CVisit FirstMatch(const CNode& node) {
    for (const CDispatchRow& row : kDispatchOrder)
        if (row.is_instance(node)) return row.visit;
    return &VisitAny;
}

// Native classes live as long as the process, so their addresses may be keys. It never grows beyond the
// number of these classes, a third of its size.
class CVisitByClass {
  public:
    CVisit Find(const CNode& node) {
        const nb::handle type = node.Self().type();
        CEntry& entry = _EntryOf(type.ptr());
        if (entry.type == type.ptr()) return entry.visit;
        const CVisit visit = FirstMatch(node);
        if (!nb::inst_python_derived(node.Self())) entry = {type.ptr(), visit};
        return visit;
    }

  private:
    struct CEntry {
        const void* type = nullptr;
        CVisit visit = nullptr;
    };

    // The entry of a class, or the free one that it would take.
    CEntry& _EntryOf(const void* type) {
        size_t i = (reinterpret_cast<uintptr_t>(type) * 0x9E3779B97F4A7C15U) >> (64 - kSizeBits);
        while (_fEntries[i].type != nullptr && _fEntries[i].type != type) i = (i + 1) % _fEntries.size();
        return _fEntries[i];
    }

    static constexpr int kSizeBits = 8;
    std::array<CEntry, size_t{1} << kSizeBits> _fEntries;
};

}  // namespace

CVisit VisitFor(const CNode& node) {
    static CVisitByClass visits;
    return visits.Find(node);
}

}  // namespace codeloom
