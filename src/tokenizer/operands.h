// Operands side by side, which no version of the language allows, strings apart.
#pragma once

#include <cstddef>
#include <cstdint>
#include <string_view>

#include "text/token_type.h"
#include "tokenizer/keywords.h"
#include "tokenizer/string_lexer.h"

namespace codeloom {

// A token by its text, neither comment nor backslash.
struct CRowToken {
    std::string_view text;
    int16_t type = 0;
    EWord word = EWord::kNone;
};

// The token ends an operand. A string without closing quotes counts, unless its text may go on after a sign.
inline bool IsOperandEnd(const CRowToken& token) {
    switch (token.type) {
        case kTokenId_NAME:
            return IsOperandWord(token.word);
        case kTokenId_NUMBER:
        case kTokenId_STRING:
        case kTokenId_RPAR:
        case kTokenId_RSQB:
        case kTokenId_RBRACE:
            return true;
        case kTokenId_ERRORTOKEN: {
            const EByteKind last_kind = ByteKind(token.text.back());
            return token.text.size() > 1 && last_kind != EByteKind::kOperator &&
                   last_kind != EByteKind::kOpener;
        }
        default:
            return false;
    }
}

// A name, number or string begins at `pos`.
inline bool BeginsOperand(std::string_view text, size_t pos) {
    const EByteKind kind = ByteKind(text[pos]);
    if (kind == EByteKind::kDigit || kind == EByteKind::kQuote) return true;
    return kind == EByteKind::kNameStart && IsOperandWord(WordAt(text, pos));
}

inline bool BeginsString(std::string_view text, size_t pos) {
    return CanBeginString(text[pos]) && ReadStringStart(text, pos).quote_length > 0;
}

// What begins at `pos` must follow an operand: a closing bracket, a comma, a binary operator but a sign.
inline bool ContinuesExpression(std::string_view text, size_t pos) {
    const char c = text[pos];
    switch (ByteKind(c)) {
        case EByteKind::kCloser:
            return true;
        case EByteKind::kNameStart:
            return keywords::Has(WordAt(text, pos), keywords::kAfterOperand);
        case EByteKind::kDot:
            return !IsDigit(ByteAt(text, pos + 1)) && ByteAt(text, pos + 1) != '.';
        case EByteKind::kOperator:
            if (c == '-' && ByteAt(text, pos + 1) == '>') return true;
            return std::string_view("+-~*@`!;").find(c) == std::string_view::npos;
        default:
            return false;
    }
}

// What begins at `pos` can't follow `token`.
inline bool AreOperandsSideBySide(const CRowToken& token, std::string_view text, size_t pos) {
    if (!BeginsOperand(text, pos) || !IsOperandEnd(token)) return false;
    return token.type != kTokenId_STRING || !BeginsString(text, pos);
}

}  // namespace codeloom
