#include "tree/node.h"

#include <cassert>

#include "host/errors.h"

namespace codeloom {

void CNodeClassInfo::Init(nb::object cls, int nodetype, nb::object name) {
    if (!name.is_none() && !IsText(name)) RaiseWrongType("str", name);
    fCls = std::move(cls);
    fNodeType = nodetype;
    fName = std::move(name);
}

CNodeRef CNodeClassInfo::TakeFree() {
    CNodeRef node = std::move(fFirstFree);
    if (!node) return node;
    assert(node->fIsFree && node->fText.is_none() && node->fChildren.IsNone());
    fFirstFree = node->fNextFree;
    node->fIsFree = false;
    return node;
}

void CNodeClassInfo::PutBack(CNodeRef node) {
    CNode& free = *node;
    if (free.fIsFree) return;
    free.fIsFree = true;
    const CNodeRef stale = std::move(free.fNextFree);  // dropped last: that may run host code
    free.fNextFree = std::move(fFirstFree);
    fFirstFree = std::move(node);
}

CNode::~CNode() {
    // A chain of free nodes is unlinked in a loop: dropping it by recursion would overflow the stack.
    CNodeRef next = std::move(fNextFree);
    while (next && next.IsOnlyReference()) next = std::move(next->fNextFree);
}

// What accessors ask for: each reads the children themselves, as an override that calls its base expects.

Py_ssize_t CNode::GetChildCount() {
    return fChildren.Size();
}

Py_ssize_t CNode::_GetChildCount() {
    return fChildren.Size();
}

CTextOrNone CNode::GetChildText(Py_ssize_t child_i) {
    return _TextAt(child_i);
}

CTextOrNone CNode::_GetChildText(Py_ssize_t i) {
    return _TextAt(i);
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
