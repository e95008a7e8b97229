// What imports answer.
#pragma once

#include <span>

#include "syntax/nodes.h"
#include "text/text_buffer.h"

namespace codeloom {

// One imported name: `a.b`, `a.b as c`
//   child    name  'as'  name
struct CImportedName {
    const CTreeNode* name = nullptr;     // a name, or a kDottedName
    const CTreeNode* as_name = nullptr;  // null without `as`
};

inline CImportedName ImportedNameOf(const CTree& tree, const CTreeNode& node) {
    if (node.child_count != 3 || !HasWordAt(tree, node, 1, EWord::kAs)) return {&node, nullptr};
    return {&tree.Child(node, 0), &tree.Child(node, 2)};
}

// `import a.b as c, d`
//   child    'import'  name, `name as name`, or a list of such
inline const CTreeNode& NamesOfImport(const CTree& tree, const CTreeNode& statement) {
    return tree.Child(statement, 1);
}

// `from .a import b as c, d`
//   child    'from'  ['.' or '...'] ...  [name]  'import'  names
//   child    ...  'import'  '('  names  ')'
//   child    ...  'import'  '*'
// Requires: the node is a kFromImport.
uint32_t ImportIndexOf(const CTree& tree, const CTreeNode& statement);

// The module after `from`, with its dots.
inline std::span<const CTreeNode> ModuleOfFromImport(const CTree& tree, const CTreeNode& statement) {
    return tree.Children(statement).subspan(1, ImportIndexOf(tree, statement) - 1);
}

// `from a import *`: the star; null for names.
inline const CTreeNode* StarOfFromImport(const CTree& tree, const CTreeNode& statement) {
    const CTreeNode& last = LastChild(tree, statement);
    return IsToken(last, kTokenId_STAR) ? &last : nullptr;
}

// One name or a list of them, without the parentheses around it.
inline const CTreeNode& NamesOfFromImport(const CTree& tree, const CTreeNode& statement) {
    const uint32_t names_i = ImportIndexOf(tree, statement) + 1;
    return tree.Child(statement, HasTokenAt(tree, statement, names_i, kTokenId_LPAR) ? names_i + 1 : names_i);
}

// Calls visit(imported) for each name of a list, or for the one that is in its place.
template <class Visit>
void ForEachImportedName(const CTree& tree, const CTreeNode& names, Visit visit) {
    if (!HasTokenAt(tree, names, 1, kTokenId_COMMA)) return visit(ImportedNameOf(tree, names));
    for (const CTreeNode& child : tree.Children(names))
        if (!IsToken(child, kTokenId_COMMA)) visit(ImportedNameOf(tree, child));
}

// Appends the texts of the leaves of an imported name, with nothing between them.
void AppendLeafTexts(const CTree& tree, const CTreeNode& name, CTextBuffer& text);

}  // namespace codeloom
