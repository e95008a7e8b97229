// What came with Python 3.15: the tokens in the way are passed over, and the grammar takes the others.
#include <algorithm>
#include <utility>

#include "syntax/span_parser.h"

namespace codeloom {

bool CSpanParser::_BeginsLazyImport(const CTokenSpan& span, uint32_t lazy_i) const {
    const uint32_t next_i = span.Next(lazy_i);
    return _fLanguage.has_newer_statements &&
           (span.IsWord(next_i, EWord::kImport) || span.IsWord(next_i, EWord::kFrom));
}

//   [*a for a in b]    {**a for a in b}    lazy import b    if a: lazy import b    (PEP 798, PEP 810)
//    ^                  ^^                 ^^^^                   ^^^^             passed over
std::vector<CTokenRange> CSpanParser::_RangesOfNewestForms(const CTokenSpan& span) {
    constexpr uint32_t kNone = CTokenSpan::kNone;
    std::vector<CTokenRange> ranges;
    std::vector<uint32_t> stars;  // by open bracket: what its first item begins with
    const auto note = [&](const CForm& form, uint32_t i) {
        _fForms.Note(form, i);
        ranges.push_back({i, i + 1});
    };
    for (uint32_t i = span.First(); i < span.end; i = span.Next(i)) {
        const CRawToken& token = span.Token(i);
        if (IsOpenerType(token.type)) {
            const uint32_t next_i = span.Next(i);
            const int star_type = token.type == kTokenId_LBRACE && span.IsType(next_i, kTokenId_DOUBLESTAR)
                                      ? kTokenId_DOUBLESTAR
                                      : kTokenId_STAR;
            stars.push_back(span.IsType(next_i, star_type) ? next_i : kNone);
        } else if (stars.empty()) {
            if (token.word == EWord::kLazy && _BeginsLazyImport(span, i)) note(forms::kLazyImport, i);
        } else if (IsCloserType(token.type)) {
            stars.pop_back();
        } else if (token.type == kTokenId_COMMA) {
            stars.back() = kNone;
        } else if (token.word == EWord::kFor && stars.back() != kNone) {
            note(forms::kUnpackingComprehension, std::exchange(stars.back(), kNone));
        }
    }
    std::sort(ranges.begin(), ranges.end(),
              [](const CTokenRange& one, const CTokenRange& other) { return one.start < other.start; });
    return ranges;
}

}  // namespace codeloom
