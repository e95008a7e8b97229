#include "tree/recycling.h"

namespace codeloom {

namespace {

constexpr Py_ssize_t kMaxDepth = 100;

CNode& NodeToRecycle(nb::handle node) {
    if (node.is_none()) throw nb::attribute_error("'NoneType' object has no attribute 'fClsInfo'");
    return *Instance<CNode>(node);
}

void __FinishedWithNode(CNode& node, Py_ssize_t depth);

// A node of the host may be among its own children, so that it comes back here before its loop is over.
void FinishChildren(TChildren<CNode>& children, Py_ssize_t depth) {
    const nb::object list = children.ListOfHost();
    const Py_ssize_t count = children.Size();
    for (Py_ssize_t i = 0; i < count; ++i) {
        if (list.is_valid()) {
            const nb::object child = nb::borrow(ListItem(list, i));
            __FinishedWithNode(NodeToRecycle(child), depth);
        } else if (i < children.Size()) {
            const CNodeRef child(&children.At(i));
            __FinishedWithNode(*child, depth);
        }
    }
    children.SetNone();
}

void __FinishedWithNode(CNode& node, Py_ssize_t depth) {
    if (depth > kMaxDepth) {
        nb::print("depth too great");
        return;
    }
    if (node.fClsInfo) {
        node.fNextFree = std::move(node.fClsInfo->fFirstFree);
        node.fClsInfo->fFirstFree = CNodeRef(&node);
    }
    if (!node.fChildren.IsNone()) FinishChildren(node.fChildren, depth + 1);
    node.fText = nb::none();
    node.fContext = nb::none();
}

}  // namespace

void FinishedWithNode(nb::handle node) {
    __FinishedWithNode(NodeToRecycle(node), 0);
}

}  // namespace codeloom
