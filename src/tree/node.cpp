#include "tree/node.h"

namespace codeloom {

namespace {

// Past the end is no child; below the start is the host's IndexError.
CNode* ChildOrNull(const nb::object& children, Py_ssize_t i) {
    if (children.is_none() || i >= ListSize(children)) return nullptr;
    return Instance<CNode>(ListItem(children, i));
}

}  // namespace

void CNodeClassInfo::Init(nb::object cls, int nodetype, nb::object name) {
    if (!name.is_none() && !IsText(name)) RaiseWrongType("str", name);
    fCls = std::move(cls);
    fNodeType = nodetype;
    fName = std::move(name);
}

CNode::~CNode() {
    // A chain of free nodes is unlinked in a loop: dropping it by recursion would overflow the stack.
    CNodeRef next = std::move(fNextFree);
    while (next && next.IsOnlyReference()) next = std::move(next->fNextFree);
}

Py_ssize_t CNode::GetChildCount() {
    return _GetChildCount();
}

Py_ssize_t CNode::_GetChildCount() {
    return fChildren.is_none() ? 0 : ListSize(fChildren);
}

nb::object CNode::GetChildText(Py_ssize_t child_i) {
    return _GetChildText(child_i);
}

nb::object CNode::_GetChildText(Py_ssize_t i) {
    const CNode* const child = ChildOrNull(fChildren, i);
    return child == nullptr ? nb::none() : child->fText;
}

CNodeRef CNode::GetChild(Py_ssize_t child_i) {
    return CNodeRef(ChildOrNull(fChildren, child_i));
}

nb::object CNode::GetStateName() {
    return fClsInfo ? fClsInfo->fName : Self().type().attr("__name__");
}

bool CNode::_DoesChildTextMatch(nb::str text) {
    const nb::object children = fChildren;
    if (children.is_none()) return false;
    for (Py_ssize_t i = 0; i < ListSize(children); ++i)
        if (Instance<CNode>(ListItem(children, i))->fText.equal(text)) return true;
    return false;
}

}  // namespace codeloom
