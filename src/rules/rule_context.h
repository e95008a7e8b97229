// What a rule over the tree of one line gets: the tree, the language, and where problems go.
#pragma once

#include <string>
#include <string_view>

#include "rules/name_set.h"
#include "rules/problem.h"
#include "syntax/language.h"
#include "syntax/nodes.h"

namespace codeloom {

struct CRuleContext {
    // Brackets in brackets; the interpreter takes no deeper text.
    static constexpr int kMaxDepth = 400;

    const CTree& tree;
    const CLanguage& language;
    CProblems& problems;
    CNameSet& names;  // for a rule that compares names; it clears the set first

    // False for most lines: no name in them is one that can't be bound, `__debug__` or the None of Python 2.
    bool MayHaveUnbindableNames() const {
        return tree.Line().MayHaveWords(kDebugNameBit | WordBits(EWord::kNoneValue));
    }

    void Report(ECode code, const CTreeNode& node, std::string message, std::string hint = {}) const {
        const CSpan span = SpanOf(tree, node);
        problems.push_back({code, span.start, span.end, std::move(message), std::move(hint), {}});
    }
};

// The texts joined.
template <class... Texts>
std::string Joined(const Texts&... texts) {
    std::string joined;
    (joined.append(texts), ...);
    return joined;
}

}  // namespace codeloom
