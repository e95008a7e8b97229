#include "walker/dispatch.h"

#include "tree/class_cache.h"

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

}  // namespace

CVisit VisitFor(const CNode& node) {
    static CClassCache<CVisit, 8> visits;
    const nb::handle node_class = node.Self().type();
    if (const CVisit* const visit = visits.Find(node_class)) return *visit;
    const CVisit visit = FirstMatch(node);
    // Native classes live as long as the process.
    return nb::inst_python_derived(node.Self()) ? visit : visits.Put(node_class, visit);
}

}  // namespace codeloom
