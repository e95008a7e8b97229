#include "syntax/tree_size.h"

#include <algorithm>

namespace codeloom {

namespace {

uint32_t HeightOf(const CTreeNode& node, const std::vector<uint32_t>& heights) {
    uint32_t height = 0;
    for (uint32_t i = 0; i < node.child_count; ++i) height = std::max(height, heights[node.first_child + i]);
    return height + 1;
}

}  // namespace

// Children lie before their parents.
bool CTreeSize::IsWithin(const CTree& tree, uint32_t most_nodes, uint32_t most_depth) {
    const std::span<const CTreeNode> nodes = tree.NodesBelowRoot();
    if (nodes.size() < most_depth) return nodes.size() < most_nodes;
    _fHeights.clear();
    for (const CTreeNode& node : nodes) _fHeights.push_back(HeightOf(node, _fHeights));
    return nodes.size() < most_nodes && HeightOf(tree.fRoot, _fHeights) <= most_depth;
}

}  // namespace codeloom
