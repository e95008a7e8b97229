#include "walker/node_walker.h"

#include "host/restore.h"

namespace codeloom {

void CNodeWalker::Init(nb::tuple version_triple) {
    _fPy3 = version_triple >= nb::make_tuple(3, 0);
}

void CNodeWalker::Walk(CNodeRef node, CLogicalLine& logical) {
    if (_fLogical) RaiseWalkInProgress();
    if (!node) return;
    const CRestoreOnExit idle_logical(_fLogical, CRef<CLogicalLine>(&logical));
    const CRestoreOnExit idle_visits(_fVisitCount, 0);
    const CRestoreOnExit idle_depth(_fRecurseCount, 0);
    RunLimited([&] { _VisitNode(*node); });
}

void CNodeWalker::_VisitChildren(CNode& node) {
    const nb::object children = node.fChildren;
    if (children.is_none()) return;
    for (Py_ssize_t i = 0; i < ListSize(children); ++i) {
        const CNodeRef child(Instance<CNode>(ListItem(children, i)));
        _VisitNode(*child);
    }
}

void CNodeWalker::_VisitNode(CNode& node) {
    if (++_fVisitCount > kMaxVisits) RaiseTooManyVisits();
    const CRestoreOnExit depth(_fRecurseCount, _fRecurseCount + 1);
    if (_fRecurseCount > kMaxRecurseCount) RaiseTooDeep();
    _VisitChildren(node);
}

void BindNodeWalker(nb::module_& module) {
    nb::class_<CNodeWalker, TNodeWalkerOperations<CNodeWalker>> binding(
        module, "CNodeWalker", Collected<CNodeWalker>(), "Records what a logical line does with names.");
    binding.def(TInit<nb::tuple>(), "version_triple"_a)
        .def_rw("_fPy3", &CNodeWalker::_fPy3, "True when the analysed language level is 3.0 or later.");
    BindOperations(binding);
}

}  // namespace codeloom
