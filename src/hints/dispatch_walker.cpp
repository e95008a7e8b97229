#include "hints/dispatch_walker.h"

#include "host/errors.h"
#include "host/restore.h"

namespace codeloom {

void CDispatchWalker::Init(nb::object dispatch_dict) {
    if (!dispatch_dict.is_none() && !nb::isinstance<nb::dict>(dispatch_dict))
        RaiseWrongType("dict", dispatch_dict);
    _fIsNative = !nb::inst_python_derived(Self());
    _fDispatch.Set(std::move(dispatch_dict));
}

void CDispatchWalker::InitWithVisits(nb::dict dispatch_dict, std::vector<CNativeVisit> native_visits) {
    for (const CNativeVisit& visit : native_visits) dispatch_dict[visit.node_class] = visit.callable;
    _fIsNative = !nb::inst_python_derived(Self());
    _fDispatch.Set(std::move(dispatch_dict), std::move(native_visits));
}

void CDispatchWalker::Walk(CNodeRef node, CLogicalLine& logical, bool) {
    if (_fLogical) RaiseWalkInProgress();
    const CRestoreOnExit idle_logical(_fLogical, CRef<CLogicalLine>(&logical));
    const CCallOnExit idle([this] {
        _fLimits.Reset();
        DropEach(_fNodeStack);
    });
    DropEach(_fNodeStack);
    RunLimited([&] { _VisitNode(std::move(node)); });
}

void CDispatchWalker::_VisitNode(CNodeRef node) {
    _fLimits.CountVisit();
    _fNodeStack.push_back(node);
    CVisitLimits::CheckDepth(static_cast<Py_ssize_t>(_fNodeStack.size()));
    const CCallOnExit popped([this] {
        if (_fNodeStack.empty()) return;
        const CNodeRef left = std::move(_fNodeStack.back());
        _fNodeStack.pop_back();
    });
    if (_AreChildrenWanted(node)) _VisitChildren(node);
    HostAssert(!_fNodeStack.empty() && _fNodeStack.back().get() == node.get());
}

bool CDispatchWalker::_AreChildrenWanted(const CNodeRef& node) {
    using EAction = CDispatchTable::EAction;
    const CDispatchTable::CEntry& entry = _fDispatch.Find(node ? node->Self().type() : nb::none().type());
    switch (entry.action) {
        case EAction::kVisitChildren:
            return true;
        case EAction::kSkip:
            return false;
        case EAction::kCallNative:
            return IsTrue(entry.function(*this, *node));
        case EAction::kCallHost:
            return IsTrue(nb::borrow(entry.callable)(Self(), node.AsHost()));
    }
    return true;
}

void CDispatchWalker::_VisitChildren(const CNodeRef& node) {
    if (!node) return;
    for (Py_ssize_t i = 0; i < node->fChildren.Size(); ++i) {
        const CNode* const child = node->fChildren.TryAt(i);
        if (child != nullptr && _IsIdleLeaf(*child)) {
            _fLimits.CountVisit();
            CVisitLimits::CheckDepth(static_cast<Py_ssize_t>(_fNodeStack.size()) + 1);
        } else {
            _VisitNode(node->fChildren.RefAt<CNode>(i));
        }
    }
}

// True for a leaf whose visit would do nothing but count. More than half of all nodes are such.
bool CDispatchWalker::_IsIdleLeaf(const CNode& node) {
    if (!_fIsNative || !node.fChildren.IsNone()) return false;
    const CDispatchTable::EAction action = _fDispatch.Find(node.Self().type()).action;
    return action == CDispatchTable::EAction::kVisitChildren || action == CDispatchTable::EAction::kSkip;
}

nb::list CDispatchWalker::GetNodeStack() const {
    nb::list stack;
    for (const CNodeRef& node : _fNodeStack) stack.append(node.AsHost());
    return stack;
}

void BindDispatchWalker(nb::module_& module) {
    nb::class_<CDispatchWalker, THostSubclass<CDispatchWalker>> binding(
        module, "CDispatchWalker", Collected<CDispatchWalker>(),
        "A node walker that uses a dispatch dictionary keyed by node types to determine which visit method "
        "to call.");
    binding.def(TInit<nb::object>(), "dispatch_dict"_a.none())
        .def_ro("_fLogical", &CDispatchWalker::_fLogical, "The logical being walked; None between walks.")
        .def_prop_ro(
            "_fDispatchDict", &CDispatchWalker::GetDispatchDict,
            "The dispatch dictionary: exact node class to a callable of (walker, node), or to False. "
            "A change counts from the next node on.")
        .def_prop_ro("_fNodeStack", &CDispatchWalker::GetNodeStack,
                     "The nodes from the root to the one now visited, as a new list.");
    BindOperations(binding);
}

}  // namespace codeloom
