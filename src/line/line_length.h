// Which logical lines are too long to be analysed.
//   in     the lines of a file, one after the other
//   out    what makes one too long
//   keeps  the text that the records of the file's lines repeat
//   start  at CLengthLimits::Take
// The analysis takes time in proportion to a line's text and to its records. But records repeat the text: the
// chain `a.b.c` has the names `a`, `a.b` and `a.b.c`, and each target of an assignment gets the text of the
// value. So the repeated text is limited, for a line and for a whole file, which keeps the records of all its
// lines.
#pragma once

#include <cstddef>
#include <cstdint>
#include <string>

#include "tokenizer/raw_logical.h"

namespace codeloom {

enum class ETooLong : uint8_t { kNot, kTokens, kRepeatedText, kRepeatedTextOfFile };

class CLengthLimits {
  public:
    static constexpr size_t kMostTokens = 1'000'000;  // of a line: some megabytes of text

    // The most bytes that chains of names or the targets of an assignment may come to in records: of a line,
    // and, for each byte of it, of a file on top.
    static constexpr size_t kMostRepeatedText = 20'000'000;
    static constexpr size_t kMostRepeatedTextPerByte = 20;

    explicit CLengthLimits(size_t file_size)
        : _fMostRepeatedText(MostRepeatedText(file_size)), _fRepeatedTextLeft(_fMostRepeatedText) {}

    // What the lines have repeated so far, and what those of a file may.
    size_t RepeatedText() const { return _fMostRepeatedText - _fRepeatedTextLeft; }
    static constexpr size_t MostRepeatedText(size_t file_size) {
        return kMostRepeatedText + file_size * kMostRepeatedTextPerByte;
    }

    // True when `line` is too long, the expressions within it included. Otherwise what its records repeat
    // counts from now on.
    ETooLong Take(const CRawLogical& line) {
        return line.tokens.size() <= kFewTokens && line.embedded.empty() ? ETooLong::kNot : _Measure(line);
    }

    // What to say about a line that is too long.
    static std::string Message(ETooLong what, const CRawLogical& line);

  private:
    static constexpr size_t kFewTokens = 200;  // can't repeat much

    ETooLong _Measure(const CRawLogical& line);

    size_t _fMostRepeatedText;
    size_t _fRepeatedTextLeft;
};

}  // namespace codeloom
