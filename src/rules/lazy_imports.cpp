#include "rules/lazy_imports.h"

#include <string>
#include <string_view>
#include <utility>

#include "syntax/imports.h"

namespace codeloom {

namespace {

// What of a block counts most against a lazy import in it; empty where nothing does.
std::string_view WhatForbidsLazyImport(EClause clause) {
    switch (clause) {
        case EClause::kDef:
        case EClause::kAsyncDef:
            return "functions";
        case EClause::kClass:
            return "classes";
        case EClause::kTry:
        case EClause::kExcept:
        case EClause::kBareExcept:
        case EClause::kExceptStar:
        case EClause::kFinally:
            return "try/except blocks";
        case EClause::kWith:
        case EClause::kAsyncWith:
            return "with blocks";
        default:
            return {};
    }
}

// The outermost function or class counts, or else the innermost block. `header` is that of the line.
std::string_view WhatForbidsLazyImport(const std::vector<CBlock>& blocks, EClause header) {
    std::string_view found;
    for (const CBlock& block : blocks) {
        const std::string_view what = WhatForbidsLazyImport(block.clause);
        if (IsScope(block.clause)) return what;
        if (!what.empty()) found = what;
    }
    const std::string_view what = WhatForbidsLazyImport(header);
    return what.empty() ? found : what;
}

// Module level only, and nowhere where an exception of the import is expected (PEP 810).
void CheckLazyImport(const CTree& tree, const CTreeNode& node, const CBlockTracker& blocks,
                     CProblems& problems) {
    const bool is_from = node.Is(ENodeKind::kFromImport);
    const std::string_view around = WhatForbidsLazyImport(blocks.Blocks(), blocks.Head().clause);
    std::string message;
    if (!around.empty()) {
        message.append("lazy import not allowed inside ").append(around);
    } else if (is_from && StarOfFromImport(tree, node) != nullptr) {
        message = "lazy from ... import * is not allowed";
    } else if (IsFutureImport(tree, node)) {
        message = "lazy from __future__ import is not allowed";
    } else {
        return;
    }
    const CRawToken& lazy = tree.Line().tokens[node.token - 1];
    problems.push_back(
        {ECode::kLazyImportPlaced, lazy.start, lazy.start + lazy.length, std::move(message), {}, {}});
}

}  // namespace

bool IsFutureImport(const CTree& tree, const CTreeNode& statement) {
    if (!statement.Is(ENodeKind::kFromImport)) return false;
    const std::span<const CTreeNode> module = ModuleOfFromImport(tree, statement);
    return module.size() == 1 && tree.Text(module[0]) == "__future__";
}

// They are on a line of their own, or in the body on the row of its header.
void CheckLazyImports(const CTree& tree, const CBlockTracker& blocks, CProblems& problems) {
    const std::vector<CRawToken>& tokens = tree.Line().tokens;
    const auto check = [&](const CTreeNode& node) {
        const bool is_import = node.Is(ENodeKind::kFromImport) || node.Is(ENodeKind::kImportNames);
        if (is_import && node.token > 0 && tokens[node.token - 1].word == EWord::kLazy)
            CheckLazyImport(tree, node, blocks, problems);
    };
    check(tree.fRoot);
    for (const CTreeNode& node : tree.NodesBelowRoot())
        if (!tree.IsRoot(node)) check(node);
}

}  // namespace codeloom
