// What a keyword says about the row or the expression that it stands in.
#pragma once

#include <array>
#include <cstddef>
#include <string_view>

#include "neighbours/tokenizer/char_class.h"
#include "neighbours/tokenizer/string_lexer.h"

namespace codeloom {

namespace keywords {

template <size_t count>
constexpr bool IsOneOf(std::string_view word, const std::array<std::string_view, count>& words) {
    for (const std::string_view candidate : words) {
        if (word == candidate) return true;
    }
    return false;
}

// Begin a statement and stand nowhere else: in no version of the language inside brackets.
inline constexpr auto kStatementOnly = std::to_array<std::string_view>(
    {"def", "class", "return", "import", "raise", "pass", "break", "continue", "del", "global", "assert",
     "while", "with", "try", "except", "finally", "elif"});

// Stand between two operands, or begin what may follow an operand.
inline constexpr auto kBinary =
    std::to_array<std::string_view>({"and", "or", "in", "is", "not", "if", "else", "for", "async", "as"});

// Of these, the ones that nothing can begin with.
inline constexpr auto kBehindOperand = std::to_array<std::string_view>({"and", "or", "in", "is", "as"});

// Further words that are no operands, or not surely.
inline constexpr auto kNoOperand =
    std::to_array<std::string_view>({"lambda", "yield", "from", "await", "print", "exec", "nonlocal"});

// Begin the header of a compound statement, `if`, `else` and `for` if they don't continue an expression.
inline constexpr auto kHeader = std::to_array<std::string_view>(
    {"def", "class", "if", "elif", "else", "for", "while", "with", "try", "except", "finally"});

}  // namespace keywords

// The ASCII word at `pos`; empty where none begins, or where it runs on with other characters.
constexpr std::string_view WordAt(std::string_view text, size_t pos) {
    size_t end = pos;
    while (IsNameByte(ByteAt(text, end))) ++end;
    return IsAscii(ByteAt(text, end)) ? text.substr(pos, end - pos) : std::string_view();
}

// The word is a name or a constant, in all versions of the language.
constexpr bool IsOperandWord(std::string_view word) {
    return !keywords::IsOneOf(word, keywords::kBinary) && !keywords::IsOneOf(word, keywords::kNoOperand) &&
           !keywords::IsOneOf(word, keywords::kStatementOnly);
}

// The word can begin a statement in front of an operand, and be a name.
constexpr bool IsSoftKeyword(std::string_view word) {
    return word == "match" || word == "case" || word == "type";
}

constexpr bool IsHeaderKeyword(std::string_view word) {
    return keywords::IsOneOf(word, keywords::kHeader);
}

// The word may begin a compound statement.
constexpr bool IsCompoundWord(std::string_view word) {
    return IsHeaderKeyword(word) || word == "async" || word == "match" || word == "case";
}

// A row inside brackets that begins like this at `pos` proves that the brackets should have been closed
// before.
constexpr bool StartsStatement(std::string_view text, size_t pos) {
    const char first = ByteAt(text, pos);
    if (first < 'a' || first > 'w') return false;
    const std::string_view word = WordAt(text, pos);
    if (keywords::IsOneOf(word, keywords::kStatementOnly)) return true;
    if (word != "async" && word != "nonlocal") return false;
    // Names in old versions, so the word behind them decides.
    const std::string_view next = WordAt(text, SkipBlanks(text, pos + word.size()));
    if (word == "async") return next == "def" || next == "with";
    return !next.empty() && !IsDigit(next[0]) && !keywords::IsOneOf(next, keywords::kBinary);
}

}  // namespace codeloom
