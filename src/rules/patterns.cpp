#include "rules/patterns.h"

#include <algorithm>
#include <string>
#include <vector>

#include "rules/expression_kinds.h"
#include "rules/name_set.h"
#include "syntax/atoms.h"
#include "syntax/statements.h"

namespace codeloom {

namespace {

bool IsCapturePattern(const CTree& tree, const CTreeNode& node) {
    return HasWordAt(tree, node, 1, EWord::kAs);
}

bool IsGroup(const CTree& tree, const CTreeNode& node) {
    return node.kind == ENodeKind::kPattern && HasTokenAt(tree, node, 0, kTokenId_LPAR);
}

bool IsAlternatives(const CTree& tree, const CTreeNode& node) {
    return node.kind == ENodeKind::kPattern && HasTokenAt(tree, node, 1, kTokenId_VBAR);
}

bool IsStarPattern(const CTree& tree, const CTreeNode& node) {
    return node.kind == ENodeKind::kPattern && HasTokenAt(tree, node, 0, kTokenId_STAR);
}

// The name or the wildcard that takes everything; null for a pattern that may fail. Of alternatives only the
// last one may.
const CTreeNode* TakesAll(const CTree& tree, const CTreeNode& pattern) {
    const CTreeNode* node = &pattern;
    for (;;) {
        if (node->Is(ENodeKind::kNameLiteral)) return node;
        if (node->IsLeaf()) return nullptr;
        if (IsAlternatives(tree, *node)) {
            node = &LastChild(tree, *node);
        } else if (IsCapturePattern(tree, *node)) {
            node = &tree.Child(*node, 0);
        } else if (IsGroup(tree, *node)) {
            node = &tree.Child(*node, 1);
        } else {
            return nullptr;
        }
    }
}

bool IsImaginary(std::string_view number) {
    return AsLower(number.back()) == 'j';
}

std::string TextOfTokens(const CTree& tree, const CTreeNode& node) {
    if (node.IsLeaf()) return std::string(tree.Text(node));
    std::string text;
    for (const CTreeNode& child : tree.Children(node))
        if (child.IsLeaf()) text.append(tree.Text(child));
    return text;
}

// Equal for keys with the same value, as far as their text shows it: quotes and prefixes of strings don't
// count, nor do signs of zero and the difference of integers, floats and truth values.
std::string ValueOfKey(const CTree& tree, const CTreeNode& key) {
    if (IsWord(key, EWord::kTrue)) return "1";
    if (IsWord(key, EWord::kFalse)) return "0";
    std::string text = TextOfTokens(tree, key);
    if (key.Is(ENodeKind::kStringLiteral)) {
        const std::string_view marker = IsBytesText(text) ? "b'" : "'";
        return Joined(marker, ContentsOfString(text));
    }
    const std::string_view digits = std::string_view(text).substr(text[0] == '-' ? 1 : 0);
    const bool is_number = !digits.empty() && digits[0] >= '0' && digits[0] <= '9';
    if (is_number && digits.find_first_not_of("0._jJ") == std::string_view::npos) return "0";
    return text;
}

// Only a sequence holds them.
void CheckNoStar(const CRuleContext& context, const CTreeNode& pattern) {
    if (IsStarPattern(context.tree, pattern))
        context.Report(ECode::kMisplacedStar, pattern, "cannot use starred expression here");
}

class CPatternCheck {
  public:
    explicit CPatternCheck(const CRuleContext& context) : _fContext(context), _fTree(context.tree) {}

    // Adds the names that the pattern binds.
    void Visit(const CTreeNode& node, CNameSet& names) {
        if (_fDepth > CRuleContext::kMaxDepth) return;
        ++_fDepth;
        _VisitKind(node, names);
        --_fDepth;
    }

  private:
    void _VisitKind(const CTreeNode& node, CNameSet& names) {
        switch (node.kind) {
            case ENodeKind::kNameLiteral:
                return _Bind(node, names);
            case ENodeKind::kStringLiteral:
            case ENodeKind::kAtom:
                return _CheckString(node, "patterns may only match literals and attribute lookups");
            case ENodeKind::kSequencePattern:
                return HasTokenAt(_fTree, node, 0, kTokenId_LBRACE) ? _VisitMapping(node, names)
                                                                    : _VisitSequence(node, names);
            case ENodeKind::kClassPattern:
                return _VisitClass(node, names);
            case ENodeKind::kPattern:
                return _VisitPattern(node, names);
            default:
                return;
        }
    }

    void _VisitPattern(const CTreeNode& node, CNameSet& names) {
        if (node.IsLeaf()) return;
        if (IsAlternatives(_fTree, node)) return _VisitAlternatives(node, names);
        if (IsCapturePattern(_fTree, node)) {
            Visit(_fTree.Child(node, 0), names);
            const CTreeNode& name = LastChild(_fTree, node);
            if (!IsWord(name, EWord::kUnderscore)) return _Bind(name, names);
            return _fContext.Report(ECode::kCannotAssign, name, "cannot use '_' as a target");
        }
        if (IsGroup(_fTree, node)) {
            CheckNoStar(_fContext, _fTree.Child(node, 1));
            return Visit(_fTree.Child(node, 1), names);
        }
        if (IsStarPattern(_fTree, node)) return _Bind(LastChild(_fTree, node), names);
        _CheckNumber(node);
    }

    void _Bind(const CTreeNode& name, CNameSet& names) {
        if (IsWord(name, EWord::kUnderscore) || names.Add(_fTree.Text(name))) return;
        _fContext.Report(ECode::kRepeatedPatternName, name,
                         Joined("multiple assignments to name '", _fTree.Text(name), "' in pattern"));
    }

    // Each binds the same names, and only the last one may take all.
    void _VisitAlternatives(const CTreeNode& node, CNameSet& names) {
        const CNameSet before = names;
        std::vector<std::string_view> first;
        for (uint32_t i = 0; i < node.child_count; i += 2) {
            const CTreeNode& alternative = _fTree.Child(node, i);
            const CTreeNode* const all = i + 1 < node.child_count ? TakesAll(_fTree, alternative) : nullptr;
            if (all != nullptr) return _ReportUnreachable(*all);
            CNameSet own = before;
            Visit(alternative, own);
            std::vector<std::string_view> sorted = own.Names();
            std::sort(sorted.begin(), sorted.end());
            if (i > 0 && sorted != first)
                return _fContext.Report(ECode::kPatternNamesDiffer, node,
                                        "alternative patterns bind different names");
            if (i == 0) first = std::move(sorted);
            names = std::move(own);
        }
    }

    void _ReportUnreachable(const CTreeNode& name) {
        _fContext.Report(ECode::kPatternsUnreachable, name, WordsOfUnreachable(_fTree.Text(name)));
    }

    void _CheckNumber(const CTreeNode& node) {
        const CTreeNode* real = nullptr;
        for (const CTreeNode& child : _fTree.Children(node)) {
            if (!child.Is(ENodeKind::kNumberLiteral)) continue;
            if (real == nullptr) {
                real = &child;
            } else if (IsImaginary(_fTree.Text(*real))) {
                _fContext.Report(ECode::kPatternNotConstant, *real,
                                 "real number required in complex literal");
            } else if (!IsImaginary(_fTree.Text(child))) {
                _fContext.Report(ECode::kPatternNotConstant, child,
                                 "imaginary number required in complex literal");
            }
        }
    }

    void _CheckString(const CTreeNode& node, std::string_view message) {
        const EExpression kind = KindOfExpression(_fTree, node);
        if (kind == EExpression::kFString || kind == EExpression::kTString)
            _fContext.Report(ECode::kPatternNotConstant, node, std::string(message));
    }

    void _VisitSequence(const CTreeNode& node, CNameSet& names) {
        bool has_star = false;
        for (const CTreeNode& child : _fTree.Children(node)) {
            const bool is_star = IsStarPattern(_fTree, child);
            if (is_star && has_star)
                return _fContext.Report(ECode::kMultipleStars, child,
                                        "multiple starred names in sequence pattern");
            has_star |= is_star;
            Visit(child, names);
        }
    }

    void _VisitMapping(const CTreeNode& node, CNameSet& names) {
        std::vector<CKey> keys;
        for (uint32_t i = 1; i + 1 < node.child_count;) {
            const CTreeNode& key = _fTree.Child(node, i);
            const bool is_rest = IsToken(key, kTokenId_DOUBLESTAR);
            if (!is_rest) {
                _CheckString(key, "mapping pattern keys may only match literals and attribute lookups");
                if (!key.IsLeaf() && key.kind == ENodeKind::kPattern) _CheckNumber(key);
                if (!key.Is(ENodeKind::kExpression) || key.IsLeaf())
                    keys.push_back({ValueOfKey(_fTree, key), &key});
            }
            const uint32_t value_i = i + (is_rest ? 1 : 2);
            if (value_i < node.child_count) _VisitValue(_fTree.Child(node, value_i), is_rest, names);
            i = value_i + 1;
        }
        _CheckKeys(keys);
    }

    void _VisitValue(const CTreeNode& value, bool is_rest, CNameSet& names) {
        if (is_rest && IsWord(value, EWord::kUnderscore))
            _fContext.Report(ECode::kMisplacedPattern, value, "cannot use '_' as a target");
        CheckNoStar(_fContext, value);
        Visit(value, names);
    }

    struct CKey {
        std::string value;
        const CTreeNode* node;
    };

    void _CheckKeys(std::vector<CKey>& keys) {
        std::stable_sort(keys.begin(), keys.end(),
                         [](const CKey& one, const CKey& other) { return one.value < other.value; });
        const auto repeated =
            std::adjacent_find(keys.begin(), keys.end(),
                               [](const CKey& one, const CKey& other) { return one.value == other.value; });
        if (repeated == keys.end()) return;
        const CKey& second = repeated[1];
        const bool is_string = second.value.find('\'') != std::string::npos;
        const std::string text = is_string ? second.value + "'" : TextOfTokens(_fTree, *second.node);
        _fContext.Report(ECode::kRepeatedPatternKey, *second.node,
                         Joined("mapping pattern checks duplicate key (", text, ")"));
    }

    void _VisitClass(const CTreeNode& node, CNameSet& names) {
        CNameSet attributes;
        for (const CTreeNode& child : _fTree.Children(node).subspan(1)) {
            if (IsToken(child, kTokenId_LPAR) || IsToken(child, kTokenId_COMMA)) continue;
            if (child.Is(ENodeKind::kClassArgumentPattern)) {
                const CTreeNode& name = _fTree.Child(child, 0);
                if (!attributes.Add(_fTree.Text(name)))
                    _fContext.Report(ECode::kRepeatedPatternAttribute, name,
                                     Joined("attribute name repeated in class pattern: ", _fTree.Text(name)));
                _VisitValue(_fTree.Child(child, 2), false, names);
            } else {
                if (!attributes.Names().empty())
                    return _fContext.Report(ECode::kMisplacedPattern, child,
                                            "positional patterns follow keyword patterns");
                _VisitValue(child, false, names);
            }
        }
    }

    const CRuleContext& _fContext;
    const CTree& _fTree;
    int _fDepth = 0;
};

}  // namespace

std::string WordsOfUnreachable(std::string_view name) {
    return name == "_" ? "wildcard makes remaining patterns unreachable"
                       : Joined("name capture '", name, "' makes remaining patterns unreachable");
}

const CTreeNode* TakesAllCases(const CTree& tree, const CTreeNode& statement) {
    if (!statement.Is(ENodeKind::kCase)) return nullptr;
    const CTreeNode* const guard = GuardOfCase(tree, statement);
    const bool has_guard = guard != nullptr && !IsToken(*guard, kTokenId_COLON);
    return has_guard ? nullptr : TakesAll(tree, PatternOfCase(tree, statement));
}

void CheckPattern(const CRuleContext& context, const CTreeNode& pattern) {
    CNameSet names;
    CheckNoStar(context, pattern);
    CPatternCheck(context).Visit(pattern, names);
}

}  // namespace codeloom
