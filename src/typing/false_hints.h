// What looks like a type hint and isn't one.
//   in     the text of a file, then its lines one after the other
//   out    which of their hints aren't hints
//   keeps  what the file says of `Literal`, once it matters
//   start  at CFalseHints::BeginLine
// The walk for hints takes every comment that begins with "type:" for a hint, except a bare `# type: ignore`.
// But people write `# type: ignore[code]` and plain prose there too, and forms of hints that the grammar
// doesn't know. It takes strings in annotations for hints, except in `Literal[...]`; but people write prose
// there too, and one line doesn't show that its file says `from typing import Literal as L`.
#pragma once

#include <optional>
#include <string>
#include <string_view>
#include <unordered_set>
#include <vector>

#include "tokenizer/raw_logical.h"

namespace codeloom {

// The names that a file imports `Literal` under, beside its own; found out when they are first asked for.
class CLiteralNames {
  public:
    // `file_text` must outlive it.
    explicit CLiteralNames(std::string_view file_text) : _fText(file_text) {}

    const std::unordered_set<std::string_view>& Get();
    // For a text that is known to have these, which must outlive it.
    void Know(std::unordered_set<std::string_view> names) { _fNames = std::move(names); }

  private:
    std::string_view _fText;
    std::optional<std::unordered_set<std::string_view>> _fNames;
};

// False where what is in [start, end) of a text can't be a part of what gives `Literal` another name.
bool MayNameLiteral(std::string_view text, size_t start, size_t end);

class CFalseHints {
  public:
    // `file_text` must outlive it.
    explicit CFalseHints(std::string_view file_text)
        : _fText(file_text), _fOwnLiteralNames(file_text), _fLiteralNames(_fOwnLiteralNames) {}

    // For a part of a file, whose parts share the names.
    CFalseHints(std::string_view file_text, CLiteralNames& literal_names)
        : _fText(file_text), _fOwnLiteralNames({}), _fLiteralNames(literal_names) {}

    CFalseHints(const CFalseHints&) = delete;
    CFalseHints& operator=(const CFalseHints&) = delete;

    // The names for `Literal` have mattered.
    bool HasAskedForLiterals() const { return _fHasAskedForLiterals; }

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

    std::string_view _fText;
    CLiteralNames _fOwnLiteralNames;
    CLiteralNames& _fLiteralNames;
    bool _fHasAskedForLiterals = false;
    const CRawLogical* _fLine = nullptr;
    // The tokens that were passed, and what is before each bracket that is open after them.
    size_t _fPassedCount = 0;
    std::vector<std::string_view> _fOpenNames;
};

}  // namespace codeloom
