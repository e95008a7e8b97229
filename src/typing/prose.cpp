#include "typing/prose.h"

#include <string>

#include "text/white_space.h"
#include "text/words.h"
#include "tokenizer/keywords.h"

namespace codeloom {

namespace {

constexpr std::string_view kBrackets = "[](){}";
// No expression begins with one of them.
constexpr std::string_view kNeverFirst = "<>=/%&|^@,:)]}\\";

bool IsOperatorWord(std::string_view word) {
    switch (WordOf(word)) {
        case EWord::kAnd:
        case EWord::kOr:
        case EWord::kNot:
        case EWord::kIn:
        case EWord::kIs:
        case EWord::kIf:
        case EWord::kElse:
            return true;
        default:
            return false;
    }
}

bool BeginsStatement(std::string_view text) {
    const EWord word = WordOf(text);
    return (IsStatementWord(word) && word != EWord::kElif) || word == EWord::kFor || word == EWord::kFrom ||
           word == EWord::kYield;
}

bool IsAsciiLetter(char c) {
    return AsLower(c) >= 'a' && AsLower(c) <= 'z';
}

std::string_view WholeWordAt(std::string_view text, size_t pos) {
    return text.substr(pos, WordEnd(text, pos) - pos);
}

// A word that no operator joins to what is before it is at `pos`.
bool IsUnjoinedWord(std::string_view text, size_t pos) {
    return WordCharLength(text, pos) != 0 && !IsOperatorWord(WholeWordAt(text, pos));
}

// The word that ends at `end`, with another one after it: no expression has two side by side.
bool IsBesideWord(std::string_view text, std::string_view word, size_t end) {
    const size_t next = SkipSpace(text, end);
    return next != end && word != "lambda" && !IsOperatorWord(word) && IsUnjoinedWord(text, next);
}

// `a = 1`, but not `a == 1`.
bool BeginsAssignment(std::string_view text) {
    size_t pos = 0;
    while (const size_t length = ByteAt(text, pos) == '.' ? 1 : WordCharLength(text, pos)) pos += length;
    if (pos == 0) return false;
    pos = SkipSpace(text, pos);
    return ByteAt(text, pos) == '=' && ByteAt(text, pos + 1) != '=';
}

bool BeginsLikeNoExpression(std::string_view text) {
    if (!text.empty() && kNeverFirst.find(text[0]) != std::string_view::npos) return true;
    const std::string_view word = WholeWordAt(text, 0);
    return BeginsStatement(word) || (IsOperatorWord(word) && word != "not") || BeginsAssignment(text);
}

// A question mark, a dash, an arrow and the like.
bool IsNoSignOfHints(std::string_view text, size_t pos) {
    if (IsAscii(text[pos])) return std::string_view("?!$;`").find(text[pos]) != std::string_view::npos;
    const uint32_t code = DecodeChar(text, pos).code;
    return code == 0x2013 || code == 0x2014 || code == 0x2026 || code == 0x2192;
}

// The bytes of the prefix of a string whose quote is at `quote`; npos where a longer word is in the way.
size_t PrefixLength(std::string_view text, size_t quote) {
    for (size_t length = 0;; ++length) {
        const std::string_view before = text.substr(0, quote - length);
        if (!EndsInWord(before)) return length;
        if (length == 2 || !IsAsciiLetter(before.back())) return std::string_view::npos;
    }
}

// The text with a word instead of each string.
std::string WithoutStrings(std::string_view text) {
    std::string result;
    size_t copied = 0;
    for (size_t pos = 0; pos < text.size(); ++pos) {
        if (text[pos] != '"' && text[pos] != '\'') continue;
        const size_t prefix_length = PrefixLength(text, pos);
        if (prefix_length == std::string_view::npos) continue;
        const size_t end = text.find(text[pos], pos + 1);
        if (end == std::string_view::npos) continue;
        result.append(text, copied, pos - prefix_length - copied).append("text");
        pos = end;
        copied = end + 1;
    }
    return result.append(text, copied);
}

// What follows the word that ends at `end` makes it no part of a hint: a quote, dots or another word.
bool IsWordOfProse(std::string_view text, std::string_view word, size_t end) {
    if (ByteAt(text, end) == '\'' || IsBesideWord(text, word, end)) return true;
    return text.substr(SkipSpace(text, end)).starts_with("..");
}

bool HoldsProse(std::string_view text) {
    if (BeginsLikeNoExpression(text)) return true;
    int open_conditions = 0;
    for (size_t pos = 0; pos < text.size();) {
        if (const std::string_view word = WholeWordAt(text, pos); !word.empty()) {
            pos += word.size();
            if (IsWordOfProse(text, word, pos)) return true;
            open_conditions += (word == "if") - (word == "else");
            continue;
        }
        if (IsNoSignOfHints(text, pos)) return true;
        if (ByteKind(text[pos]) == EByteKind::kCloser && IsUnjoinedWord(text, SkipSpace(text, pos + 1)))
            return true;
        pos += CharLength(text, pos);
    }
    return open_conditions > 0;
}

// `-> (a, b)`: what a function returns can't be a tuple without parentheses of its own.
bool HasTupleAsResult(std::string_view hint) {
    for (size_t pos = hint.find("->"); pos != std::string_view::npos; pos = hint.find("->", pos)) {
        pos = SkipSpace(hint, pos + 2);
        if (ByteAt(hint, pos) != '(') continue;
        pos = hint.find_first_of("(),", pos + 1);
        if (pos == std::string_view::npos) return false;
        if (hint[pos] == ',') return true;
    }
    return false;
}

bool HasWordsSideBySide(std::string_view text) {
    for (size_t pos = 0; pos < text.size();) {
        const std::string_view word = WholeWordAt(text, pos);
        pos += word.empty() ? CharLength(text, pos) : word.size();
        if (!word.empty() && IsBesideWord(text, word, pos)) return true;
    }
    return false;
}

bool HasThreeWords(std::string_view text) {
    int count = 0;
    for (size_t pos = 0; pos < text.size() && count < 3;) {
        const size_t end = WordEnd(text, pos);
        count += end != pos;
        pos = end == pos ? pos + CharLength(text, pos) : end;
    }
    return count == 3;
}

bool EndsLikeSentence(std::string_view text) {
    const bool has_mark =
        !text.empty() && std::string_view(".!?").find(text.back()) != std::string_view::npos;
    return has_mark && EndsInWord(text.substr(0, text.size() - 1));
}

}  // namespace

bool IsProseInComment(std::string_view hint) {
    hint = WithoutSpaceAround(hint);
    if (HasTupleAsResult(hint)) return true;
    const bool has_strings = hint.find_first_of("\"'") != std::string_view::npos;
    return has_strings ? HoldsProse(WithoutStrings(hint)) : HoldsProse(hint);
}

bool IsProseInQuotes(std::string_view text) {
    text = WithoutSpaceAtEnd(text);
    if (!HasWordsSideBySide(text.substr(0, text.find_first_of(kBrackets))) && !EndsLikeSentence(text))
        return false;
    return HasThreeWords(text) || !EndsInWord(text) || text.back() == '_';
}

}  // namespace codeloom
