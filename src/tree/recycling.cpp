#include "tree/recycling.h"

#include "host/errors.h"

namespace codeloom {

namespace {

constexpr Py_ssize_t kMaxDepth = 100;

CNodeRef NodeToRecycle(nb::handle node) {
    if (node.is_none()) throw nb::attribute_error("'NoneType' object has no attribute 'fClsInfo'");
    return CNodeRef(Instance<CNode>(node));
}

void __FinishedWithNode(CNodeRef node, Py_ssize_t depth);

// A node of the host may be among its own children, so that it comes back here before its loop is over.
void FinishChildren(TChildren<CNode>& children, Py_ssize_t depth) {
    if (const nb::object list = children.ListOfHost(); list.is_valid()) [[unlikely]] {
        const Py_ssize_t count = ListSize(list);
        for (Py_ssize_t i = 0; i < count; ++i) __FinishedWithNode(NodeToRecycle(ListItem(list, i)), depth);
    }
    children.TakeAll([depth](CNodeRef child) { __FinishedWithNode(std::move(child), depth); });
}

void __FinishedWithNode(CNodeRef node, Py_ssize_t depth) {
    if (depth > kMaxDepth) {
        PrintReport(nb::str("depth too great"));
        return;
    }
    CNode& finished = *node;
    if (finished.fClsInfo) {
        finished.fNextFree = std::move(finished.fClsInfo->fFirstFree);
        finished.fClsInfo->fFirstFree = std::move(node);
    }
    if (!finished.fChildren.IsNone()) FinishChildren(finished.fChildren, depth + 1);
    finished.fText = nb::none();
    finished.fContext = nb::none();
}

}  // namespace

void FinishedWithNode(nb::handle node) {
    __FinishedWithNode(NodeToRecycle(node), 0);
}

}  // namespace codeloom
