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
#include <vector>

#include "neighbours/logical_types.h"
#include "neighbours/tokenizer/lexer.h"
#include "neighbours/tokenizer/place.h"
#include "neighbours/tokenizer/scopes.h"

namespace codeloom {

// Rows count from zero, from the logical's first row in a logical and from the text's first row elsewhere.
// Columns count UTF-8 bytes from zero.
struct CPosition {
    int32_t row = 0;
    int32_t col = 0;
};

struct CRawToken {
    std::string_view text;  // into the text of the file; a separator is no token
    CPosition position;     // from the logical's first row
    int16_t type = 0;       // as GetTokenType gives it
};

// One logical line, or one expression embedded in a logical line.
struct CRawLogical {
    ELogicalType type = ELogicalType::kUnknown;
    int32_t first_row = 0;  // in the text of the file, for an embedded logical too
    // Where position (0, 0) of this logical stands in the file: {first_row, 0} for a top-level logical; the
    // place of its first character for an embedded one, whose columns in row 0 are relative to the embedded
    // text.
    CPosition origin;
    bool in_async_def = false;  // lies in the body or the header of an `async def`
    bool first_in_def = false;  // is the first logical of a def's body
    std::vector<CRawToken> tokens;
    std::vector<CRawLogical> embedded;  // in source order
};

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
    struct COpenBracket {
        size_t pos;
        char closer;
    };
    enum class EEnd { kSound, kUnclosed };

    bool _SkipToLogical();
    void _CollectComment(CRawLogical& logical);
    void _CollectStatement(CRawLogical& logical);
    EEnd _CollectTokens(CRawLogical& logical, const CReach& reach);
    void _AddToken(CRawLogical& logical);
    bool _TrackBracket();
    bool _IsSeparator(const CRawLogical& logical);
    void _EndAtSeparator(CRawLogical& logical);
    bool _ProvesUnclosed(const CRawLogical& logical) const;
    void _RememberUnclosed();
    bool _IsKnownUnclosed(size_t pos);

    CLexer _fLexer;
    CPlace _fPlace;
    CScopes _fScopes;
    bool _fMidRow = false;  // behind a separator
    int32_t _fIndent = 0;   // of the first row of the logical line
    bool _fIsCompound = false;
    std::vector<COpenBracket> _fBrackets;
    // Brackets that an earlier look ahead has proven to be unclosed, in source order.
    std::vector<size_t> _fUnclosed;
    size_t _fUnclosed_i = 0;
};

}  // namespace codeloom
