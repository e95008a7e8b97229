// The tokens of a piece of Python text, one after the other, each with the brackets open around it.
#pragma once

#include <cstddef>
#include <string_view>

#include "tokenizer/lexer.h"

namespace codeloom {

class CStringTokens {
  public:
    // Begins on the first token. `text` must outlive it.
    explicit CStringTokens(std::string_view text) : _fLexer(text) { _Take(0); }

    bool IsAtEnd() const { return _fPos == _fLexer.Text().size(); }

    // The text of the current token; empty at the end.
    std::string_view Token() const { return _fLexer.Text().substr(_fPos, _fEnd - _fPos); }

    // The byte offset of the current token; the length of the text at the end.
    size_t Pos() const { return _fPos; }

    // The brackets open around the current token: a bracket itself isn't counted, neither when it opens nor
    // when it closes. Closers too many don't count.
    size_t NestCount() const { return _fNestCount; }

    // Moves to the next token. Blanks, row ends, comments and backslashes between rows aren't tokens.
    void Next();

  private:
    void _Take(size_t pos);

    CLexer _fLexer;
    size_t _fPos = 0;
    size_t _fEnd = 0;
    size_t _fNestCount = 0;
};

}  // namespace codeloom
