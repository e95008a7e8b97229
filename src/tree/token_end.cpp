#include "tree/token_end.h"

namespace codeloom {

namespace {

const CNode* ChildOrNone(const CNode& node, Py_ssize_t child_i) {
    return node.fChildren.Size() == 0 ? nullptr : &node.ChildAt(child_i);
}

// A tree of the host may contain itself: a second walk at half the pace would be caught up with.
CNodeRef EdgeLeaf(const CNode& node, Py_ssize_t child_i) {
    const CNode* last = &node;
    const CNode* slow = &node;
    bool is_odd_step = false;
    while (const CNode* const child = ChildOrNone(*last, child_i)) {
        last = child;
        if (is_odd_step) slow = ChildOrNone(*slow, child_i);
        if (last == slow) throw nb::value_error("the tree contains itself");
        is_odd_step = !is_odd_step;
    }
    return CNodeRef(last->As<CNode>());
}

}  // namespace

CNodeRef FirstLeaf(const CNode& node) {
    return EdgeLeaf(node, 0);
}

CNodeRef LastLeaf(const CNode& node) {
    return EdgeLeaf(node, -1);
}

Py_ssize_t GetTokenEndIndex(const CNode& node) {
    return Py_ssize_t{ResultFromHost<int>(LastLeaf(node)->fContext)} + 1;
}

}  // namespace codeloom
