#include "tree/recycling.h"

namespace codeloom {

namespace {

constexpr Py_ssize_t kMaxDepth = 100;

CNode& NodeToRecycle(nb::handle node) {
    if (node.is_none()) throw nb::attribute_error("'NoneType' object has no attribute 'fClsInfo'");
    return *Instance<CNode>(node);
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
    if (!node.fChildren.is_none()) {
        const nb::object children = node.fChildren;
        const Py_ssize_t count = ListSize(children);
        for (Py_ssize_t i = 0; i < count; ++i) {
            const nb::object child = nb::borrow(ListItem(children, i));
            __FinishedWithNode(NodeToRecycle(child), depth + 1);
        }
        node.fChildren = nb::none();
    }
    node.fText = nb::none();
    node.fContext = nb::none();
}

}  // namespace

void FinishedWithNode(nb::handle node) {
    __FinishedWithNode(NodeToRecycle(node), 0);
}

}  // namespace codeloom
