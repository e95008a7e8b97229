// neighbours/tokenizer: the text of a source file into logical lines.
//   in     the UTF-8 text of a file, or of a piece of one
//   out    CRawLogical: one logical line at a time, its tokens and the logicals embedded in it
//   keeps  the state of brackets and indentation between two logicals
//   start  at CTokenizer::NextLogical
// It never fails and loses no byte: separators apart, every non-blank character lies in a token.
#pragma once

#include <cstddef>
#include <cstdint>
#include <string_view>

#include "neighbours/tokenizer/brackets.h"
#include "neighbours/tokenizer/embedded.h"
#include "neighbours/tokenizer/lexer.h"
#include "neighbours/tokenizer/place.h"
#include "neighbours/tokenizer/raw_logical.h"
#include "neighbours/tokenizer/scopes.h"

namespace codeloom {

class CTokenizer {
  public:
    // `text` must outlive the tokenizer and every logical it gave.
    explicit CTokenizer(std::string_view text);

    // The next logical line into `logical`, whose storage is reused; false at the end of the text.
    bool NextLogical(CRawLogical& logical);

  private:
    // How far a logical line reaches beyond, or falls short of, what its brackets say. Row ends before
    // `until` don't end it; the next one does, whatever is open, if it `ends_there`.
    struct CReach {
        size_t until = 0;
        bool ends_there = false;
    };
    enum class EStep { kToken, kEnd, kUnclosed };

    bool _SkipToLogical();
    void _Restart(CRawLogical& logical);
    void _CollectComment(CRawLogical& logical);
    void _CollectStatement(CRawLogical& logical);
    bool _CollectTokens(CRawLogical& logical, const CReach& reach);
    EStep _SkipToToken(const CReach& reach);
    void _AddToken(CRawLogical& logical);
    bool _IsSeparator(const CRawLogical& logical);
    bool _HasOpenQuote();
    void _EndAtSeparator(CRawLogical& logical);
    bool _ProvesUnclosed() const;
    size_t _FindStrayCloserBehind(const CRawLogical& logical);
    bool _EndsDeeper(const CRawLogical& logical) const;
    bool _IsOpen(const CReach& reach) const { return _fBrackets.AreOpen() && !reach.ends_there; }

    CLexer _fLexer;
    CPlace _fPlace;
    CScopes _fScopes;
    CEmbeddedFinder _fEmbedded;
    CRawToken _fLast;              // of the logical line, comments and backslashes apart
    CEmbeddingTokens _fEmbedding;  // what the logical line holds
    bool _fMidRow = false;         // behind a separator
    int32_t _fIndent = 0;          // of the first row of the logical line
    bool _fIsCompound = false;
    CBrackets _fBrackets;
    size_t _fQuotesKnownUpTo = 0;  // as far as _fHasOpenQuote is known
    bool _fHasOpenQuote = false;
    size_t _fNoStrayCloserBefore = 0;  // as far as an earlier look ahead has seen
};

}  // namespace codeloom
