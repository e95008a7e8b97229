#include "tree/token_end.h"

namespace codeloom {

namespace {

const CNode* LastChild(const CNode& node) {
    return node.fChildren.is_none() || ListSize(node.fChildren) == 0 ? nullptr : &node.ChildAt(-1);
}

// A tree of the host may contain itself: a second walk at half the pace would be caught up with.
const CNode& LastLeaf(const CNode& node) {
    const CNode* last = &node;
    const CNode* slow = &node;
    bool is_odd_step = false;
    while (const CNode* const child = LastChild(*last)) {
        last = child;
        if (is_odd_step) slow = LastChild(*slow);
        if (last == slow) throw nb::value_error("the tree contains itself");
        is_odd_step = !is_odd_step;
    }
    return *last;
}

}  // namespace

Py_ssize_t GetTokenEndIndex(const CNode& node) {
    return Py_ssize_t{ResultFromHost<int>(LastLeaf(node).fContext)} + 1;
}

}  // namespace codeloom
