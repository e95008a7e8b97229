// Nodes that no grammar state makes. They have children and nothing else: no text, and no record whose free
// list they could go back to.
#pragma once

#include <vector>

#include "tree/node.h"

namespace codeloom {

template <class Node>
CNodeRef NewPseudoNode(nb::list children) {
    const CRef<Node> node = NewInstance<Node>();
    node->fChildren.SetList(std::move(children));
    return CNodeRef(node.get());
}

// The same; an empty reference becomes none.
template <class Node>
CNodeRef NewPseudoNode(const std::vector<CNodeRef>& children) {
    nb::list nodes;
    for (const CNodeRef& child : children) nodes.append(child.AsHost());
    return NewPseudoNode<Node>(std::move(nodes));
}

}  // namespace codeloom
