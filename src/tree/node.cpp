#include "tree/node.h"

#include "host/errors.h"

namespace codeloom {

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
    return fChildren.Size();
}

CTextOrNone CNode::GetChildText(Py_ssize_t child_i) {
    return _GetChildText(child_i);
}

CTextOrNone CNode::_GetChildText(Py_ssize_t i) {
    return ChildText(i);
}

CNodeRef CNode::GetChild(Py_ssize_t child_i) {
    return _HasItem(child_i) ? CNodeRef(&ChildAt(child_i)) : CNodeRef();
}

CTextOrNone CNode::GetStateName() {
    return fClsInfo ? CTextOrNone(fClsInfo->fName) : CTextOrNone(Self().type().attr("__name__"));
}

bool CNode::_DoesChildTextMatch(nb::str text) {
    for (Py_ssize_t i = 0; _HasItem(i); ++i) {
        const nb::object child_text = ChildAt(i).fText;
        if (IsText(child_text) && child_text.equal(text)) return true;
    }
    return false;
}

bool CNode::HasToken(std::string_view token) const {
    for (Py_ssize_t i = 0; _HasItem(i); ++i)
        if (ChildAt(i).HasText(token)) return true;
    return false;
}

}  // namespace codeloom
