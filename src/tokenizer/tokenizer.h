// tokenizer: the text of a source file into logical lines.
//   in     the UTF-8 text of a file, or of a piece of one
//   out    CRawLogical: one logical line at a time, its tokens and the logicals embedded in it
//   keeps  the state of brackets and indentation between two logicals
//   start  at CTokenizer::NextLogical
// It never fails and loses no byte: separators apart, every non-blank character lies in a token.
#pragma once

#include <cstddef>
#include <cstdint>
#include <string_view>

#include "text/place.h"
#include "tokenizer/brackets.h"
#include "tokenizer/embedded.h"
#include "tokenizer/lexer.h"
#include "tokenizer/operators.h"
#include "tokenizer/raw_logical.h"
#include "tokenizer/scopes.h"

namespace codeloom {

// What the tokens of a logical line have shown so far.
struct CLineFacts {
    CEmbeddingTokens embedding;
    int depth = 0;         // of brackets; closers without an opener count too
    int open_lambdas = 0;  // outside brackets, whose ":" is still to come
    bool is_assignment = false;
    bool has_hint_sign = false;  // a ":" or "->"
    bool has_strings = false;
    bool has_special_strings = false;
    uint64_t words = 0;  // a bit for each
};

class CTokenizer {
  public:
    // `text` must outlive the tokenizer and every logical it gave. std::length_error for one of more than
    // kMaxTextSize bytes.
    explicit CTokenizer(std::string_view text) : CTokenizer(text, 0) {}

    // The same from `start` on, the beginning of a row before which IsFresh; it isn't indented, or else
    // IsInClassOnly was true for it.
    CTokenizer(std::string_view text, size_t start, bool is_in_class = false);

    // The next logical line into `logical`, whose storage is reused; false at the end of the text.
    bool NextLogical(CRawLogical& logical);

    // What comes next doesn't depend on what was before, but for the definitions around it: it begins a row,
    // and nothing is known of it yet.
    bool IsFresh() const {
        return !_fMidRow && _fQuotesKnownUpTo <= _fPlace.pos && _fBrackets.KnowsNothingFrom(_fPlace.pos);
    }

    // Around the line that was given last, which is indented, is a class of the module and no other
    // definition.
    bool IsInClassOnly() const { return _fScopes.IsInClassOnly(_fIndent); }

    const CLexer& Lexer() const { return _fLexer; }

  private:
    // Tokens are collected up to the end of the logical line, or, when its brackets are known not to be
    // closed, up to a row that is known to begin the next one.
    static constexpr size_t kUpToEnd = 0;
    enum class EStep { kToken, kEnd, kUnclosed };

    bool _SkipToLogical();
    void _Restart(CRawLogical& logical);
    void _CollectComment(CRawLogical& logical);
    void _CollectStatement(CRawLogical& logical);
    bool _CollectTokens(CRawLogical& logical, size_t forced_end);
    EStep _SkipRows(const CRawLogical& logical, size_t forced_end);
    void _Add(CRawLogical& logical, size_t end, int16_t type, EWord word);
    void _AddName(CRawLogical& logical, std::string_view text);
    void _AddWord(CRawLogical& logical, size_t length, EWord word);
    void _AddOperator(CRawLogical& logical, std::string_view text);
    void _AddToken(CRawLogical& logical);
    void _Note(size_t pos, CLexedToken token);
    void _NoteSign(COperator op);
    void _NoteLambda() { _fFacts.open_lambdas += _fFacts.depth == 0; }
    bool _IsSeparator(const CRawLogical& logical);
    bool _HasOpenQuote();
    void _EndAtSeparator(CRawLogical& logical);
    bool _ProvesUnclosed(const CRawLogical& logical);
    bool _BeginsHeader(const CRawLogical& logical);
    bool _EndsHeader(const CRawLogical& logical) const;
    bool _IsOpen(size_t forced_end) const { return _fBrackets.AreOpen() && forced_end == kUpToEnd; }

    CLexer _fLexer;
    CPlace _fPlace;
    CScopes _fScopes;
    CEmbeddedFinder _fEmbedded;
    CLineFacts _fFacts;
    bool _fMidRow = false;  // after a separator
    int32_t _fIndent = 0;   // of the first row of the logical line
    bool _fIsCompound = false;
    CBrackets _fBrackets;
    size_t _fQuotesKnownUpTo = 0;  // as far as _fHasOpenQuote is known
    bool _fHasOpenQuote = false;
};

}  // namespace codeloom
