// What the parser says of a line after a small edit: the way to find out what it expected, and which slip
// explains a fault.
#pragma once

#include <climits>
#include <initializer_list>
#include <vector>

#include "syntax/line_parser.h"
#include "tokenizer/raw_logical.h"

namespace codeloom {

// A token that isn't in the text.
struct CInventedToken {
    int16_t type = kTokenId_NAME;
    EWord word = EWord::kNone;

    constexpr CInventedToken(int16_t token_type) : type(token_type) {}
    constexpr CInventedToken(EWord name) : word(name) {}
};

inline constexpr CInventedToken kAnyName{kTokenId_NAME};

// Tokens in place of `removed` ones from `at` on.
struct CEdit {
    int at = 0;
    int removed = 0;
    std::initializer_list<CInventedToken> inserted = {};
};

class CLineProbe {
  public:
    static constexpr int kSound = INT_MAX;

    // `language` must outlive it.
    explicit CLineProbe(const CLanguage& language) : _fParser(language) {}

    // The index of the token at fault in the edited line; kSound when it has no fault.
    int FaultWith(const CRawLogical& line, bool in_async_def, const CEdit& edit);

  private:
    CLineParser _fParser;
    CTree _fTree;
    CRawLogical _fEdited;  // its storage stays
};

}  // namespace codeloom
