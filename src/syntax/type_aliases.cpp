// What distinguishes `type` the keyword from `type` the name.
#include "syntax/span_parser.h"
#include "tokenizer/keywords.h"

namespace codeloom {

namespace {

// Calls visit(start, end) for each statement on a row: for those of the body after a header, or for all.
template <class Visit>
void ForEachStatement(const CTokenSpan& span, Visit visit) {
    const uint32_t first_i = span.First();
    bool has_header = first_i < span.end && IsCompoundWord(span.Token(first_i).word);
    uint32_t start = has_header ? CTokenSpan::kNone : first_i;
    ForEachOutsideBrackets(span, first_i, [&](uint32_t i, const CRawToken& token) {
        const bool ends_statement = token.type == kTokenId_SEMI;
        const bool ends_header = has_header && token.type == kTokenId_COLON;
        if (ends_statement && start != CTokenSpan::kNone) visit(start, i);
        if (ends_statement || ends_header) start = i + 1;
        if (ends_header) has_header = false;
        return true;
    });
    if (start != CTokenSpan::kNone) visit(start, span.end);
}

}  // namespace

//   type X = int    type X[T] = list[T]
//          ^                  ^             distinguishes it from `type`, the name
bool CSpanParser::_BeginsTypeAlias(const CTokenSpan& span, uint32_t type_i) const {
    const uint32_t name_i = span.Next(type_i);
    if (!_IsPlainName(span, name_i)) return false;
    uint32_t i = span.Next(name_i);
    if (span.IsType(i, kTokenId_LSQB)) {
        i = span.Find(kTokenId_RSQB, i + 1, span.end);
        if (i == CTokenSpan::kNone) return true;  // the bracket is what is wrong
        i = span.Next(i);
    }
    return span.IsType(i, kTokenId_EQUAL);
}

// The assignment that an alias is parsed as has one `=`, and one expression after it.
void CSpanParser::_RequireAlias(const CTreeNode& node) const {
    const bool has_parameters = node.Is(ENodeKind::kWithTypeParameters);
    const CTreeNode& assignment = has_parameters ? _fTree->Children(node).back() : node;
    if (assignment.child_count > 3) throw CRefusal{_fTree->Child(assignment, 3).token};
    _RequireSingle(_fTree->Child(assignment, 2));
}

//   if a: type X = int; type Y[T] = list[T]
//         ^^^^          ^^^^  ^^^             to be passed over, once each alias has been parsed by itself
std::vector<CTokenRange> CSpanParser::_RangesOfAliases(const CTokenSpan& span) {
    std::vector<CTokenRange> ranges(span.removed.begin(), span.removed.end());
    ForEachStatement(span, [&](uint32_t start, uint32_t end) {
        const CTokenSpan statement = span.Within(start, end);
        const uint32_t type_i = statement.First();
        if (!statement.IsWord(type_i, EWord::kType) || !_BeginsTypeAlias(statement, type_i)) return;
        _ParseWithTypeParameters(statement, type_i);
        const uint32_t name_i = statement.Next(type_i);
        const uint32_t equal_i = statement.Find(kTokenId_EQUAL, name_i, end);
        ranges.push_back({type_i, name_i});
        ranges.push_back({name_i + 1, equal_i});
    });
    return ranges;
}

}  // namespace codeloom
