// What looks like a type hint and is none.
//   in     the text of a file, then its lines one after the other
//   out    which of their hints aren't hints
//   keeps  what the file says of `Literal`, once it matters
//   start  at CFalseHints::BeginLine
// The walk for hints takes every comment that begins with "type:" for a hint, save a bare `# type: ignore`.
// But people write `# type: ignore[code]` and plain prose there too, and forms of hints that the grammar
// doesn't know. It takes strings in annotations for hints, save within `Literal[...]`; but people write prose
// there too, and one line doesn't show that its file says `from typing import Literal as L`.
#pragma once

#include <optional>
#include <string>
#include <string_view>
#include <unordered_set>
#include <vector>

#include "tokenizer/raw_logical.h"

namespace codeloom {

class CFalseHints {
  public:
    // `file_text` must outlive it.
    explicit CFalseHints(std::string_view file_text) : _fText(file_text) {}

    // The questions below are about `line` from now on. It costs nothing until one is asked.
    void BeginLine(const CRawLogical& line);

    // The hint of a comment of the line, as HintInComment gives it.
    bool IsFalseInComment(std::string_view hint) const;

    // Replaces by blanks what the grammar doesn't know: `(int, *str) -> (bool)`.
    static void MakeReadable(std::string& hint);

    // A hint in quotes, one of those embedded in the line. Asked for in their order.
    bool IsFalseInQuotes(const CRawLogical& quoted);

  private:
    bool _TakesNothing() const;
    bool _IsInLiteral(uint32_t pos);
    std::string_view _NameBeforeBracketAt(uint32_t pos);
    const std::unordered_set<std::string_view>& _LiteralNames();

    std::string_view _fText;
    std::optional<std::unordered_set<std::string_view>>
        _fLiteralNames;  // beside its own; none until it matters
    const CRawLogical* _fLine = nullptr;
    // The tokens that were passed, and what is before each bracket that is open after them.
    size_t _fPassedCount = 0;
    std::vector<std::string_view> _fOpenNames;
};

}  // namespace codeloom
