// Tokens, or texts made of several, into the text of an expression.
#pragma once

#include <cstdint>
#include <span>
#include <string>
#include <string_view>

#include "text/text_buffer.h"
#include "text/words.h"

namespace codeloom {

// Joins the pieces with blanks as a formatter would: one around binary operators and words, one after a
// comma and a colon, none within brackets, after a sign, before a trailer and around `.`, `**` and `=`. A
// piece is a token or the text of an expression; empty ones are left out.
std::string JoinTokens(std::span<const std::string_view> pieces);

// The same, piece by piece, for a text that grows.
class CTokenJoiner {
  public:
    // Puts a blank, where one belongs, before the piece that is in `text` from `start` to its end.
    void PartFromPrevious(std::string& text, size_t start);

    // Appends the blank that belongs before a token, which the caller appends next.
    void PartFromToken(CTextBuffer& text, int16_t token_type, EWord word);

    // Around a piece of several tokens: Begin gives where it starts, End takes a blank away that didn't
    // belong.
    size_t BeginPiece(CTextBuffer& text) const;
    void EndPiece(CTextBuffer& text, size_t start);

    enum class EPiece : uint8_t {
        kNone,     // before the first piece
        kOperand,  // a name, a literal, an expression
        kTrailer,  // `.name`, or an operand that begins with ( or [
        kWord,     // a keyword that isn't an operand, or an expression that ends with one
        kOpener,
        kBrace,  // an opener that doesn't begin a trailer
        kCloser,
        kComma,  // a semicolon too
        kColon,
        kSliceColon,  // a colon with nothing before it
        kTight,       // an operator with no blanks around it
        kSign,        // a unary operator
        kBinary,
    };

  private:
    EPiece _fPrevious = EPiece::kNone;
};

}  // namespace codeloom
