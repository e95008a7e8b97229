#include "syntax/tree_check.h"

#include <cassert>
#include <vector>

#include "syntax/tree.h"

namespace codeloom {

#ifndef NDEBUG

namespace {

void CheckLeaf(const CTree& tree, const CTreeNode& leaf) {
    const size_t token_count = tree.Line().tokens.size();
    if (leaf.first_child == CTreeNode::kInventedText) {
        assert(leaf.token <= token_count);
    } else {
        assert(leaf.first_child == 0 && leaf.token < token_count);
    }
}

}  // namespace

void CheckTree(const CTree& tree) {
    if (tree.fIsEmpty) return;
    const size_t node_count = tree.NodesBelowRoot().size();
    std::vector<bool> has_parent(node_count);
    std::vector<const CTreeNode*> waiting = {&tree.fRoot};
    while (!waiting.empty()) {
        const CTreeNode& node = *waiting.back();
        waiting.pop_back();
        if (node.IsLeaf()) {
            CheckLeaf(tree, node);
            continue;
        }
        assert(node.first_child + node.child_count <= node_count);
        assert((tree.Kinds() & CTree::BitOf(node.kind)) != 0);
        for (uint32_t i = node.first_child; i < node.first_child + node.child_count; ++i) {
            assert(!has_parent[i]);
            has_parent[i] = true;
            waiting.push_back(&tree.NodesBelowRoot()[i]);
        }
    }
}

#else

void CheckTree(const CTree&) {}

#endif

}  // namespace codeloom
