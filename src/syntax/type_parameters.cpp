// Lists of type parameters, and what they belong to: a definition or a type alias.
#include "syntax/span_parser.h"

namespace codeloom {

namespace {

// Statements in the bounds of type parameters, which may have type parameters themselves. No text that means
// anything has one.
constexpr int kMaxNesting = 20;

class CNestingScope {
  public:
    CNestingScope(int& nesting, uint32_t token_i) : _fNesting(nesting) {
        if (_fNesting == kMaxNesting) throw CRefusal{token_i};
        ++_fNesting;
    }
    ~CNestingScope() { --_fNesting; }
    CNestingScope(const CNestingScope&) = delete;
    CNestingScope& operator=(const CNestingScope&) = delete;

  private:
    int& _fNesting;
};

// While it lives, nodes are added that become the children of one.
class CChildrenScope {
  public:
    explicit CChildrenScope(std::vector<CTreeNode>& nodes) : _fNodes(nodes), _fFirst(nodes.size()) {}
    ~CChildrenScope() { _fNodes.resize(_fFirst); }
    CChildrenScope(const CChildrenScope&) = delete;
    CChildrenScope& operator=(const CChildrenScope&) = delete;

    std::span<const CTreeNode> Children() const { return std::span(_fNodes).subspan(_fFirst); }

  private:
    std::vector<CTreeNode>& _fNodes;
    const size_t _fFirst;
};

bool MayBeBeyondGrammar(EWord word) {
    switch (word) {
        case EWord::kWith:
        case EWord::kMatch:
        case EWord::kCase:
        case EWord::kExcept:
        case EWord::kType:
        case EWord::kDef:
        case EWord::kClass:
        case EWord::kAsync:
            return true;
        default:
            return false;
    }
}

}  // namespace

// The children of a type parameter.
class CSpanParser::CFewNodes {
  public:
    void Add(const CTreeNode& node) { _fNodes[_fCount++] = node; }
    CTreeNode& Last() { return _fNodes[_fCount - 1]; }
    bool HasBound() const { return _fCount > 2 && _fNodes[_fCount - 2].symbol == kTokenId_COLON; }
    std::span<const CTreeNode> Nodes() const { return std::span(_fNodes).first(_fCount); }

  private:
    std::array<CTreeNode, 5> _fNodes;  // prefix, name, `:` or `=`, and what follows
    size_t _fCount = 0;
};

// `type` is a name like any other, unless it begins an alias.
CParsed CSpanParser::_ParseWithTypeParameters(const CTokenSpan& span, uint32_t word_i) {
    if (!_fLanguage.has_newer_statements) return _ParseTypeParametersAndRest(span, word_i);
    const bool is_type = span.IsWord(word_i, EWord::kType);
    if (is_type && !_BeginsTypeAlias(span, word_i)) return {};
    const CParsed node = _ParseTypeParametersAndRest(span, word_i);
    if (!node) return node;
    if (is_type) {
        _RequireAlias(*node);
        _fForms.Note(forms::kTypeAlias, word_i);
    } else {
        _fForms.Note(forms::kTypeParameters, span.Next(span.Next(word_i)));
    }
    return node;
}

//   def f[T: int, *Ts](x):    type X[T] = list[T]
//        ^^^^^^^^^^^^^          ^^^^  ^^^            passed over by the grammar
//   a kWithTypeParameters: the type parameters, the statement
CParsed CSpanParser::_ParseTypeParametersAndRest(const CTokenSpan& span, uint32_t word_i) {
    const uint32_t name_i = span.Next(word_i);
    if (!span.IsName(name_i)) return {};
    const uint32_t open_i = span.Next(name_i);
    if (open_i >= span.end) return {};
    const bool is_type = span.IsWord(word_i, EWord::kType);
    const CTokenRange word{word_i, word_i + (is_type ? 1 : 0)};
    if (!span.IsType(open_i, kTokenId_LSQB))
        return is_type ? ParseByGrammar(span.Without({&word, 1})) : CParsed();

    const uint32_t close_i = span.Find(kTokenId_RSQB, open_i + 1, span.end);
    if (close_i == CTokenSpan::kNone) throw CRefusal{open_i};
    const CChildrenScope scope(_fNodes);
    _ParseTypeParameters(span, open_i, close_i);
    const std::array ranges = {word, CTokenRange{open_i, close_i + 1}};
    const CParsed statement = ParseByGrammar(span.Without(ranges));
    if (!statement) return statement;
    _fNodes.push_back(*statement);
    return _fTree->AddParent(ENodeKind::kWithTypeParameters, 0, statement->token, scope.Children());
}

// Adds the nodes of the type parameters between the brackets to `_fNodes`.
void CSpanParser::_ParseTypeParameters(const CTokenSpan& span, uint32_t open_i, uint32_t close_i) {
    const bool is_empty = span.Next(open_i) >= close_i;
    if (is_empty && _fLanguage.has_newer_statements) throw CRefusal{close_i};
    for (uint32_t i = open_i + 1; i < close_i;) {
        const uint32_t comma_i = std::min(span.Find(kTokenId_COMMA, i, close_i), close_i);
        const uint32_t start = span.Next(i - 1);  // a comment may be before it
        if (start < comma_i) _fNodes.push_back(_ParseTypeParameter(span, start, comma_i));
        i = comma_i + 1;
    }
}

//   T        *Ts        T: int
//   T = int        name '=' default
//   T: a = b       name ':' node, a kNode of the bound, '=' and the default
CTreeNode CSpanParser::_ParseTypeParameter(const CTokenSpan& span, uint32_t start, uint32_t end) {
    CFewNodes children;
    const uint32_t equal_i =
        _fLanguage.has_newer_statements ? span.Find(kTokenId_EQUAL, start, end) : CTokenSpan::kNone;
    if (equal_i == start) throw CRefusal{start};
    _ParseNameAndBound(span, start, std::min(equal_i, end), children);
    if (equal_i != CTokenSpan::kNone) {
        _fForms.Note(forms::kTypeDefault, equal_i);
        const CTreeNode value = _ParseDefault(span, equal_i, end);
        const CTreeNode equal = LeafOf(span, equal_i);
        if (children.HasBound()) {
            const CTreeNode bound = children.Last();
            children.Last() =
                _fTree->AddParent(ENodeKind::kNode, 0, bound.token, std::array{bound, equal, value});
        } else {
            children.Add(equal);
            children.Add(value);
        }
    }
    return _fTree->AddParent(ENodeKind::kTypeParameter, 0, start, children.Nodes());
}

void CSpanParser::_ParseNameAndBound(const CTokenSpan& span, uint32_t start, uint32_t end,
                                     CFewNodes& children) {
    uint32_t name_i = start;
    if (span.IsType(start, kTokenId_STAR) || span.IsType(start, kTokenId_DOUBLESTAR)) {
        children.Add(LeafOf(span, start));
        name_i = span.Next(start);
    }
    if (!span.IsName(name_i)) throw CRefusal{start};
    CTreeNode name = LeafOf(span, name_i);
    name.kind = ENodeKind::kNameLiteral;
    children.Add(name);
    const uint32_t colon_i = span.Next(name_i);
    if (colon_i >= end) return;
    if (!span.IsType(colon_i, kTokenId_COLON) || colon_i + 1 >= end) throw CRefusal{colon_i};
    if (const CParsed bound = _ParseBound(span.Part(colon_i + 1, end))) {
        children.Add(LeafOf(span, colon_i));
        children.Add(*bound);
    }
}

CTreeNode CSpanParser::_ParseDefault(const CTokenSpan& span, uint32_t equal_i, uint32_t end) {
    if (span.Next(equal_i) >= end) throw CRefusal{end};
    const CParsed value = _ParseBound(span.Part(equal_i + 1, end));
    if (!value) throw CRefusal{end};
    if (!value->Is(ENodeKind::kStar)) _RequireSingle(*value);
    return *value;
}

CParsed CSpanParser::_ParseBound(const CTokenSpan& span) {
    const uint32_t i = span.First();
    if (i >= span.end || !MayBeBeyondGrammar(span.Token(i).word))
        return _fStatementParser.Parse(span, *_fTree);
    const CNestingScope nesting(_fNesting, i);
    return Parse(span);
}

}  // namespace codeloom
