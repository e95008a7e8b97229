#include "hints/dispatch_walker.h"

#include "host/errors.h"
#include "host/restore.h"
#include "walker/walk_limits.h"

namespace codeloom {

void CDispatchWalker::Init(nb::object dispatch_dict) {
    if (!dispatch_dict.is_none() && !nb::isinstance<nb::dict>(dispatch_dict))
        RaiseWrongType("dict", dispatch_dict);
    _fDispatchDict = std::move(dispatch_dict);
}

void CDispatchWalker::Walk(CNodeRef node, CLogicalLine& logical, bool) {
    if (_fLogical) RaiseWalkInProgress();
    const CRestoreOnExit idle_logical(_fLogical, CRef<CLogicalLine>(&logical));
    const CRestoreOnExit idle_visits(_fVisitCount, 0);
    const CRestoreOnExit idle_depth(_fRecurseCount, 0);
    _fNodeStack.clear();
    const CCallOnExit empty_stack([this] { _fNodeStack.clear(); });
    RunLimited([&] { _VisitNode(node); });
}

void CDispatchWalker::_VisitNode(CNodeRef node) {
    if (++_fVisitCount > kMaxVisits) RaiseTooManyVisits();
    _fNodeStack.push_back(node);
    if (_fNodeStack.size() > static_cast<size_t>(kMaxRecurseCount)) RaiseTooDeep();
    if (_AreChildrenWanted(node)) _VisitChildren(node);
    HostAssert(!_fNodeStack.empty() && _fNodeStack.back().get() == node.get());
    if (!_fNodeStack.empty()) _fNodeStack.pop_back();
}

bool CDispatchWalker::_AreChildrenWanted(const CNodeRef& node) {
    const nb::object host_node = node.AsHost();
    const nb::object visit = FindInDict(_fDispatchDict, host_node.type());
    if (!visit.is_valid() || visit.is_none()) return true;
    if (visit.is(Py_False)) return false;
    return nb::cast<bool>(nb::bool_(visit(Self(), host_node)));
}

void CDispatchWalker::_VisitChildren(const CNodeRef& node) {
    if (!node) return;
    const nb::object children = node->fChildren;
    if (children.is_none()) return;
    for (Py_ssize_t i = 0; i < ListSize(children); ++i) _VisitNode(CNodeRef::FromHost(ListItem(children, i)));
}

void BindDispatchWalker(nb::module_& module) {
    nb::class_<CDispatchWalker, TDispatchWalkerOperations<CDispatchWalker>> binding(
        module, "CDispatchWalker", Collected<CDispatchWalker>(),
        "A node walker that uses a dispatch dictionary keyed by node types to determine which visit method "
        "to call.");
    binding.def(TInit<nb::object>(), "dispatch_dict"_a.none());
    BindOperations(binding);
}

}  // namespace codeloom
