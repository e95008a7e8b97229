#include "syntax/imports.h"

namespace codeloom {

uint32_t ImportIndexOf(const CTree& tree, const CTreeNode& statement) {
    uint32_t i = 1;
    while (i < statement.child_count && !HasWordAt(tree, statement, i, EWord::kImport)) ++i;
    return i;
}

void AppendLeafTexts(const CTree& tree, const CTreeNode& name, CTextBuffer& text) {
    if (name.IsLeaf()) {
        text += tree.Text(name);
        return;
    }
    for (const CTreeNode& child : tree.Children(name)) text += tree.Text(child);
}

}  // namespace codeloom
