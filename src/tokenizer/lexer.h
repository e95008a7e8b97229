// One token at a place of the text.
#pragma once

#include <algorithm>
#include <array>
#include <cstddef>
#include <cstdint>
#include <string_view>

#include "text/scan.h"
#include "text/words.h"
#include "tokenizer/raw_logical.h"
#include "tokenizer/string_lexer.h"

namespace codeloom {

// As small as a register.
struct CLexedToken {
    CLexedToken(size_t end_pos, int16_t token_type, EWord token_word = EWord::kNone, bool rows = false,
                bool fields = false, bool special = true)
        : end(static_cast<uint32_t>(end_pos)),
          type(token_type),
          word(token_word),
          may_span_rows(rows),
          has_fields(fields),
          is_special(special) {}

    uint32_t end;
    int16_t type;
    EWord word;
    bool may_span_rows : 1;
    bool has_fields : 1;  // an f-string or a t-string
    bool is_special : 1;  // of a string: it has a prefix, or it may have a backslash
};

inline CRawToken MakeToken(size_t pos, CLexedToken lexed, CPosition position = {}) {
    const auto start = static_cast<uint32_t>(pos);
    return {start, lexed.end - start, position, lexed.type, lexed.word};
}

class CLexer {
  public:
    explicit CLexer(std::string_view text);

    std::string_view Text() const { return _fText; }

    // The token at `pos`, which is in the text and neither a blank nor a row's end. Every character makes a
    // token: what isn't part of the language is an error token of one character, a string without closing
    // quotes one up to the end of its row, or of the text for triple quotes. `depth` counts the f-strings
    // around it.
    CLexedToken Lex(size_t pos, int depth = 0);

    // How far the text has been looked at, apart from the rows of tokens that were asked for: for the ends of
    // strings, and where brackets and quotes can't be trusted.
    size_t LookedAt() const { return _fLookedAt; }
    void NoteLook(size_t end) { _fLookedAt = std::max(_fLookedAt, end); }

    // The bytes that were scanned in vain, and those that may be before the rest is taken as it is.
    size_t ScannedInVain() const {
        return MostScannedInVain(_fText.size()) - std::min(_fWasteLeft, _fDoubtLeft);
    }
    static size_t MostScannedInVain(size_t text_size);

  private:
    CLexedToken _LexNameOrString(size_t pos, int depth);
    CLexedToken _LexString(size_t pos, const CStringStart& start, int depth);
    CStringEnd _FindFieldStringEnd(size_t pos, const CStringStart& start, int depth);
    CStringEnd _FindPlainStringEnd(size_t pos, const CStringStart& start);
    CStringEnd _JudgeTriple(size_t pos, const CStringStart& start, const CStringEnd& found);
    CLexedToken _LexBackslash(size_t pos) const;
    CLexedToken _LexOperator(size_t pos) const;

    std::string_view _fText;
    // Bytes that may still be scanned in vain for the end of broken f-strings: a share of the text's length,
    // so that hostile text takes linear time too. Sound text wastes nothing.
    size_t _fWasteLeft;
    // Likewise for doubts about triple quotes.
    size_t _fDoubtLeft;
    bool _fDoubts = true;  // not while a doubt is looked into
    size_t _fLookedAt = 0;
    // From where on no triple quotes are left, for each of the two quotes.
    std::array<size_t, 2> _fNoTripleFrom;
};

}  // namespace codeloom
