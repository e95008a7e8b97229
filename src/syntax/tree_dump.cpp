#include "syntax/tree_dump.h"

#include <algorithm>

namespace codeloom {

namespace {

constexpr size_t kMostIndents = 50;  // so that a deep tree has no dump that is longer by far

struct CPending {
    CTreeNode node;
    size_t depth;
};

void AppendNode(const CTree& tree, const CPending& pending, std::string& dump) {
    const CTreeNode& node = pending.node;
    dump.append(2 * std::min(pending.depth, kMostIndents), ' ');
    dump += kNodeKinds[static_cast<size_t>(node.kind)].class_name;
    dump += ' ' + std::to_string(node.symbol) + " @" + std::to_string(node.token);
    if (node.IsLeaf()) dump += ' ';
    for (const char c : tree.Text(node)) dump += c == '\n' ? std::string("\\n") : std::string(1, c);
    dump += '\n';
}

}  // namespace

std::string DumpOf(const CTree& tree) {
    std::string dump;
    std::vector<CPending> pending;
    if (!tree.fIsEmpty) pending.push_back({tree.fRoot, 0});
    while (!pending.empty()) {
        const CPending next = pending.back();
        pending.pop_back();
        AppendNode(tree, next, dump);
        const auto children = tree.Children(next.node);
        for (size_t i = next.node.IsLeaf() ? 0 : children.size(); i-- > 0;)
            pending.push_back({children[i], next.depth + 1});
    }
    return dump;
}

}  // namespace codeloom
