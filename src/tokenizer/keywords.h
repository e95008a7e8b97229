// What a keyword says about the row or the expression that it is in.
#pragma once

#include <array>
#include <cstddef>
#include <cstdint>
#include <initializer_list>
#include <string_view>

#include "text/char_class.h"
#include "text/scan.h"
#include "text/words.h"

namespace codeloom {

namespace keywords {

enum ETrait : uint8_t {
    kStatementOnly = 1,  // begins a statement and is nowhere else: in no version inside brackets
    kBinary = 2,         // comes between two operands, or begins what may follow an operand
    kAfterOperand = 4,   // of these, one that nothing can begin with
    kNoOperand = 8,      // a further word that isn't an operand, or may not be one
    kHeader = 16,  // begins a compound statement, `if`, `else` and `for` if they don't continue an expression
};

inline constexpr auto kTraits = [] {
    std::array<uint8_t, static_cast<size_t>(EWord::kCount)> traits{};
    const auto set = [&traits](ETrait trait, std::initializer_list<EWord> words) {
        for (const EWord word : words) traits[static_cast<size_t>(word)] |= trait;
    };
    using enum EWord;
    set(kStatementOnly, {kDef, kClass, kReturn, kImport, kRaise, kPass, kBreak, kContinue, kDel, kGlobal,
                         kAssert, kWhile, kWith, kTry, kExcept, kFinally, kElif});
    set(kBinary, {kAnd, kOr, kIn, kIs, kNot, kIf, kElse, kFor, kAsync, kAs});
    set(kAfterOperand, {kAnd, kOr, kIn, kIs, kAs});
    set(kNoOperand, {kLambda, kYield, kFrom, kAwait, kPrint, kExec, kNonlocal});
    set(kHeader, {kDef, kClass, kIf, kElif, kElse, kFor, kWhile, kWith, kTry, kExcept, kFinally});
    return traits;
}();

constexpr bool Has(EWord word, int traits) {
    return (kTraits[static_cast<size_t>(word)] & traits) != 0;
}

}  // namespace keywords

constexpr bool IsBinaryWord(EWord word) {
    return keywords::Has(word, keywords::kBinary);
}

// The ASCII word at `pos`; empty where none begins, or where it runs on with other characters.
inline std::string_view WordTextAt(std::string_view text, size_t pos) {
    const size_t end = SkipNameBytes(text, pos);
    return IsAscii(ByteAt(text, end)) ? text.substr(pos, end - pos) : std::string_view();
}

// Its number; kNone for a plain name and where no word begins.
inline EWord WordAt(std::string_view text, size_t pos) {
    const size_t end = SkipNameBytes(text, pos);
    if (end == pos || !IsAscii(ByteAt(text, end))) return EWord::kNone;
    return WordOfPart(text, pos, end - pos);
}

// The word is a name or a constant, in all versions of the language.
constexpr bool IsOperandWord(EWord word) {
    return !keywords::Has(word, keywords::kBinary | keywords::kNoOperand | keywords::kStatementOnly);
}

// The word can begin a statement in front of an operand, and be a name.
constexpr bool IsSoftKeyword(EWord word) {
    return word == EWord::kMatch || word == EWord::kCase || word == EWord::kType;
}

// The word begins a statement, and is never a part of an expression in Python 3.
constexpr bool IsStatementWord(EWord word) {
    return keywords::Has(word, keywords::kStatementOnly) || word == EWord::kNonlocal;
}

constexpr bool IsHeaderKeyword(EWord word) {
    return keywords::Has(word, keywords::kHeader);
}

// The word may begin a compound statement.
constexpr bool IsCompoundWord(EWord word) {
    return IsHeaderKeyword(word) || word == EWord::kAsync || word == EWord::kMatch || word == EWord::kCase;
}

// The word at `pos` begins the header of a statement, or continues an expression: what follows decides.
inline bool MayBeginHeader(std::string_view text, size_t pos) {
    switch (WordAt(text, pos)) {
        case EWord::kIf:
        case EWord::kFor:
        case EWord::kAsync:
        case EWord::kElse:
            return true;
        default:
            return false;
    }
}

// What is at `pos`, after `from`, is the rest of an import, not of `yield from`.
inline bool IsImported(std::string_view text, size_t pos) {
    for (;;) {
        while (IsBlank(ByteAt(text, pos)) || ByteAt(text, pos) == '.') ++pos;
        const std::string_view word = WordTextAt(text, pos);
        if (word.empty() || word == "import") return !word.empty();
        pos += word.size();
    }
}

// A row inside brackets that begins like this at `pos` proves that the brackets should have been closed
// before.
inline bool StartsStatement(std::string_view text, size_t pos) {
    const EWord word = WordAt(text, pos);
    if (word == EWord::kNone) return false;
    if (keywords::Has(word, keywords::kStatementOnly)) return true;
    const size_t end = pos + TextOfWord(word).size();
    if (word == EWord::kFrom) return IsImported(text, end);
    if (word != EWord::kAsync && word != EWord::kNonlocal) return false;
    // Names in old versions, so the word after them decides.
    const std::string_view next = WordTextAt(text, SkipBlanks(text, end));
    if (word == EWord::kAsync) return next == "def" || next == "with";
    return !next.empty() && !IsDigit(next[0]) && !IsBinaryWord(WordOf(next));
}

}  // namespace codeloom
