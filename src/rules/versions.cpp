#include "rules/versions.h"

#include <algorithm>
#include <span>

#include "rules/fields.h"
#include "syntax/atoms.h"
#include "syntax/definitions.h"
#include "syntax/forms.h"
#include "syntax/statements.h"
#include "text/char_class.h"

namespace codeloom {

namespace {

// From this version on, all that the parser doesn't know is in the fields of f-strings.
constexpr int kNeedsFieldsAlone = 309;

class CVersionCheck {
  public:
    explicit CVersionCheck(const CRuleContext& context)
        : _fContext(context), _fTree(context.tree), _fVersion(context.language.version) {}

    void Run() {
        const CRawLogical& line = _fTree.Line();
        for (size_t i = 0; i < line.tokens.size(); ++i) _CheckToken(line, i);
        if (!_fTree.fIsEmpty && _fVersion < kNeedsFieldsAlone) _CheckNodes();
        if (_fFound != nullptr)
            _fContext.problems.push_back(
                {ECode::kNewerForm, _fPlace.start, _fPlace.end, MessageOf(*_fFound), {}, {}});
    }

  private:
    void _Note(const CForm& form, const CSpan& place) {
        if (form.version <= _fVersion || (_fFound != nullptr && _fPlace.start <= place.start)) return;
        _fFound = &form;
        _fPlace = place;
    }
    void _Note(const CForm& form, const CTreeNode& node) { _Note(form, SpanOf(_fTree, node)); }

    // Tokens

    void _CheckToken(const CRawLogical& line, size_t i) {
        const CRawToken& token = line.tokens[i];
        const CSpan place{token.start, line.EndOf(token)};
        const std::string_view text = line.Text(token);
        switch (token.type) {
            case kTokenId_STRING:
                return _CheckString(line, token, text);
            case kTokenId_NUMBER:
                if (text.find('_') != std::string_view::npos) _Note(forms::kUnderscore, place);
                return;
            case kTokenId_NAME:
                if (std::any_of(text.begin(), text.end(), [](char c) { return !IsAscii(c); }))
                    _Note(forms::kUnicodeName, place);
                if (token.word == EWord::kAsync) _CheckAsync(line, i, place);
                return;
            case kTokenId_AT:
                if (i > 0) _Note(forms::kMatrixProduct, place);
                return;
            default:
                if (token.word == EWord::kMatrixAssign) _Note(forms::kMatrixProduct, place);
        }
    }

    void _CheckAsync(const CRawLogical& line, size_t i, const CSpan& place) {
        if (i + 1 >= line.tokens.size()) return;
        const EWord next = line.tokens[i + 1].word;
        if (next != EWord::kDef && next != EWord::kFor && next != EWord::kWith) return;
        _Note(i == 0 ? forms::kAsync : forms::kAsyncComprehension, place);
    }

    void _CheckString(const CRawLogical& line, const CRawToken& token, std::string_view text) {
        const CSpan place{token.start, line.EndOf(token)};
        const CStringStart start = ReadStringStart(text, 0);
        if (AsLower(text[0]) == 'u' && _fContext.language.IsPython3()) _Note(forms::kUnicodePrefix, place);
        if (start.is_bytes && start.is_raw && AsLower(text[0]) == 'r') _Note(forms::kRawBytes, place);
        if (!start.has_fields) return;
        if (_fVersion < forms::kFString.version) return _Note(forms::kFString, place);
        _CheckFields(line, token, start);
    }

    void _CheckFields(const CRawLogical& line, const CRawToken& token, const CStringStart& start) {
        const CSpan place{token.start, line.EndOf(token)};
        const std::string_view text = line.file_text;
        const CStringEnd plain =
            FindStringEnd(text, token.start + start.ContentOffset(), start.quote, start.IsTriple());
        if (plain.end != place.end) return _Note(forms::kQuotesInField, place);
        const CStringFields fields = ReadFields(line, token);
        if (fields.has_comment) _Note(forms::kCommentInField, place);
        for (const CSpan& expression : fields.expressions) {
            std::string_view source = text.substr(expression.start, expression.end - expression.start);
            if (source.find('\\') != std::string_view::npos) _Note(forms::kBackslashInField, place);
            while (!source.empty() && IsBlank(source.back())) source.remove_suffix(1);
            if (!source.empty() && source.back() == '=') _Note(forms::kSignOfField, place);
        }
    }

    // Nodes

    void _CheckNodes() {
        _CheckStatement(_fTree.fRoot);
        _CheckNode(_fTree.fRoot);
        for (const CTreeNode& node : _fTree.NodesBelowRoot())
            if (!node.IsLeaf() && !_fTree.IsRoot(node)) _CheckNode(node);
        if (_fVersion < forms::kUnpackingInDisplay.version) _CheckValues(_fTree.fRoot, 0);
    }

    // What the parser reads by hand, and takes for Python 2 too.
    void _CheckStatement(const CTreeNode& root) {
        const CRawLogical& line = _fTree.Line();
        if (root.Is(ENodeKind::kMatch)) _Note(forms::kMatch, _fTree.Child(root, 0));
        if (root.Is(ENodeKind::kCase)) _Note(forms::kCase, _fTree.Child(root, 0));
        if (line.type == ELogicalType::kTypeStatement) _Note(forms::kTypeAlias, _PlaceOf(line.tokens[0]));
        if (line.tokens.size() < 2 || _fContext.language.IsPython3()) return;
        const CRawToken& first = line.tokens[0];
        const CRawToken& second = line.tokens[1];
        if (first.word == EWord::kExcept && second.type == kTokenId_STAR)
            _Note(forms::kExceptStar, _PlaceOf(second));
        if (first.word == EWord::kWith && second.type == kTokenId_LPAR) _CheckWith(line);
    }

    // A target within parentheses.
    void _CheckWith(const CRawLogical& line) {
        int depth = 0;
        for (const CRawToken& token : line.tokens) {
            depth += IsOpenerType(token.type) - IsCloserType(token.type);
            if (depth == 1 && token.word == EWord::kAs)
                return _Note(forms::kWithBrackets, _PlaceOf(line.tokens[1]));
        }
    }

    CSpan _PlaceOf(const CRawToken& token) const { return {token.start, token.start + token.length}; }

    void _CheckNode(const CTreeNode& node) {
        switch (node.kind) {
            case ENodeKind::kUsedArglist:
                return _CheckArguments(node);
            case ENodeKind::kDefiningArglist:
                return _CheckParameters(node);
            case ENodeKind::kWithTypeParameters:
                return _Note(forms::kTypeParameters, node);
            case ENodeKind::kAnnotatedAssign:
                return _CheckAnnotated(node);
            case ENodeKind::kYield:
                if (!node.IsLeaf() && IsYieldFrom(_fTree, node)) _Note(forms::kYieldFrom, node);
                return;
            case ENodeKind::kDel:
                return _CheckTarget(*ExpressionAfterKeyword(_fTree, node));
            case ENodeKind::kFor:
                return _CheckTarget(*PartsOfFor(_fTree, node).target);
            case ENodeKind::kExprStmt:
                if (EqualCountOf(_fTree, node) > 0) _CheckTarget(TargetOf(_fTree, node, 0));
                return;
            default:
                return;
        }
    }

    void _CheckTarget(const CTreeNode& target) {
        const bool is_empty = target.Is(ENodeKind::kAtom) && target.child_count == 2 &&
                              HasTokenAt(_fTree, target, 0, kTokenId_LPAR);
        if (is_empty) _Note(forms::kEmptyTarget, target);
    }

    // `*a` once, then keywords, then `**b` once, and no comma. In Python 2 the stars are children of the
    // list.
    void _CheckArguments(const CTreeNode& list) {
        bool has_star = false, has_two_stars = false, has_keyword = false;
        const std::span<const CTreeNode> children = _fTree.Children(list);
        for (size_t i = 0; i < children.size(); i += 2) {
            const EStars leaf_stars = children[i].IsLeaf() ? StarsOf(children[i]) : EStars::kNone;
            const CTreeNode& argument = leaf_stars == EStars::kNone ? children[i] : children[++i];
            const EStars stars = leaf_stars == EStars::kNone ? StarsOfArgument(_fTree, argument) : leaf_stars;
            const bool is_named = stars == EStars::kNone && IsNamedArgument(_fTree, argument);
            const bool is_positional = stars == EStars::kNone && !is_named;
            if (has_two_stars || (has_star && (stars == EStars::kOne || is_positional)))
                return _Note(forms::kUnpackingInCall, argument);
            if (has_keyword && is_positional && !_fContext.language.IsPython3())
                return _fContext.Report(ECode::kMisplacedArgument, argument,
                                        "positional argument follows keyword argument");
            has_star |= stars == EStars::kOne;
            has_two_stars |= stars == EStars::kTwo;
            has_keyword |= is_named;
        }
        if ((has_star || has_two_stars) && IsToken(children.back(), kTokenId_COMMA))
            _Note(forms::kUnpackingInCall, children.back());
    }

    void _CheckParameters(const CTreeNode& list) {
        const bool has_star =
            HasToken(_fTree, list, kTokenId_STAR) || HasToken(_fTree, list, kTokenId_DOUBLESTAR);
        const CTreeNode& last = LastChild(_fTree, list);
        if (has_star && IsToken(last, kTokenId_COMMA)) _Note(forms::kCommaAfterStars, last);
    }

    void _CheckAnnotated(const CTreeNode& node) {
        const CTreeNode* const value = ValueOfAnnotatedAssign(_fTree, node);
        if (value != nullptr && (value->Is(ENodeKind::kTestList) || value->Is(ENodeKind::kYield)))
            _Note(forms::kAnnotatedTuple, *value);
    }

    // Stars in expressions, targets left out.
    void _CheckValues(const CTreeNode& node, int depth) {
        if (node.IsLeaf() || depth > CRuleContext::kMaxDepth) return;
        const bool is_assignment = node.Is(ENodeKind::kExprStmt);
        const bool has_target = node.Is(ENodeKind::kFor) || node.Is(ENodeKind::kCompFor);
        for (uint32_t i = 0; i < node.child_count; ++i) {
            const CTreeNode& child = _fTree.Child(node, i);
            if (is_assignment && i + 1 < node.child_count && HasTokenAt(_fTree, node, i + 1, kTokenId_EQUAL))
                continue;
            if (has_target && HasWordAt(_fTree, node, i + 1, EWord::kIn)) continue;
            if (node.Is(ENodeKind::kWithItem) && i == 2) continue;
            if (child.Is(ENodeKind::kStar)) _Note(forms::kUnpackingInDisplay, child);
            _CheckValues(child, depth + 1);
        }
        if (node.Is(ENodeKind::kAtom) && BracketOf(_fTree, node) == EBracket::kCurly) _CheckBraces(node);
    }

    void _CheckBraces(const CTreeNode& atom) {
        const CTreeNode* const contents = ContentsOfBrackets(_fTree, atom);
        if (contents == nullptr || contents->IsLeaf()) return;
        for (uint32_t i = 0; i < contents->child_count; ++i)
            if (HasTokenAt(_fTree, *contents, i, kTokenId_DOUBLESTAR) &&
                (i == 0 || HasTokenAt(_fTree, *contents, i - 1, kTokenId_COMMA)))
                _Note(forms::kUnpackingInDisplay, _fTree.Child(*contents, i));
    }

    const CRuleContext& _fContext;
    const CTree& _fTree;
    const int _fVersion;
    const CForm* _fFound = nullptr;
    CSpan _fPlace;
};

}  // namespace

void CheckVersion(const CRuleContext& context) {
    const bool needs_strings = context.language.version >= kNeedsFieldsAlone;
    if (needs_strings && !context.tree.Line().may_have_strings) return;
    CVersionCheck(context).Run();
}

}  // namespace codeloom
