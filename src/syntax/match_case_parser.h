// `match` and `case` statements, which the grammar files don't know.
//   in     a span whose first token is `match` or `case`
//   out    the node of the statement; none where the word is a plain name; CRefusal at a bad pattern
//   keeps  its lists, reused from statement to statement
//   start  at ParseMatch and ParseCase here; patterns are in case_patterns.cpp
//
// Subject, guard and body go to the grammar, patterns are parsed here by descent. It isn't a full checker of
// patterns: it decides by the first token and by separators outside brackets. Tokens are counted without
// comments and continuation backslashes here; `_fTokens` has their places in the line.
#pragma once

#include <cstdint>
#include <vector>

#include "syntax/pattern_work.h"
#include "syntax/table_parser.h"
#include "syntax/token_span.h"
#include "syntax/tree.h"
#include "tokenizer/logical_types.h"

namespace codeloom {

class CSpanParser;

class CMatchCaseParser {
  public:
    // `parser` parses what isn't a pattern, and owns this one.
    explicit CMatchCaseParser(CSpanParser& parser) : _fParser(parser) {}

    CParsed ParseMatch(const CTokenSpan& span);
    CParsed ParseCase(const CTokenSpan& span);

  private:
    using EKind = CCasePatternStep::EKind;
    using CPlan = CCasePatternWork::CPlan;

    static constexpr uint32_t kNone = CTokenSpan::kNone;
    static constexpr uint32_t kFirstAfterWord = 1;

    void _SetSpan(const CTokenSpan& span);
    void _FindBracketSteps();
    bool _IsStatementOfType(ELogicalType type) const;
    CTreeNode _ParseSubject();
    uint32_t _FindCaseColon() const;
    CParsed _ParseStatement(uint32_t start_i, uint32_t end_i);

    // Tokens of the statement.
    uint32_t _Count() const { return static_cast<uint32_t>(_fTokens.size()); }
    const CRawToken& _Token(uint32_t i) const { return _fSpan.Token(_fTokens[i]); }
    int _Type(uint32_t i) const { return _Token(i).type; }
    CTreeNode _Leaf(uint32_t i) const;
    [[noreturn]] void _FailAt(uint32_t i) const;

    // The token in [from, to) outside brackets that is of a type, or a word; kNone where there is none. Each
    // takes one step over a whole bracket, so that nested brackets cost no more than flat ones.
    template <class IsWanted>
    uint32_t _FindIf(uint32_t from, uint32_t to, IsWanted is_wanted) const;
    uint32_t _Find(int type, uint32_t from, uint32_t to) const;
    uint32_t _FindWord(EWord word, uint32_t from, uint32_t to) const;

    // Patterns, see case_patterns.cpp.
    struct CPatternTokens;
    CTreeNode _ParsePattern(uint32_t start_i, uint32_t end_i);
    void _DoStep(const CCasePatternStep& step);
    void _RefuseKeyword(uint32_t i) const;

    CSpanParser& _fParser;
    CTokenSpan _fSpan;
    CCasePatternWork _fWork;
    std::vector<uint32_t> _fTokens;
    std::vector<uint32_t> _fNext;  // by token: the next one outside of what it opens
    std::vector<uint32_t> _fOpen;  // brackets, while _fNext is being found
};

}  // namespace codeloom
