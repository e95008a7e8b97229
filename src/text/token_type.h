// The numbers of the token types, and the type that a token's text has.
#pragma once

#include <array>
#include <cstdint>
#include <string_view>

namespace codeloom {

// Every name of the numbering with its number. Where two names share a number, the later one is the name that
// the grammar loader sees.
#define CODELOOM_TOKEN_TYPES(TYPE) \
    TYPE(ENDMARKER, 0)             \
    TYPE(NAME, 1)                  \
    TYPE(NUMBER, 2)                \
    TYPE(STRING, 3)                \
    TYPE(NEWLINE, 4)               \
    TYPE(INDENT, 5)                \
    TYPE(DEDENT, 6)                \
    TYPE(LPAR, 7)                  \
    TYPE(RPAR, 8)                  \
    TYPE(LSQB, 9)                  \
    TYPE(RSQB, 10)                 \
    TYPE(COLON, 11)                \
    TYPE(COMMA, 12)                \
    TYPE(SEMI, 13)                 \
    TYPE(PLUS, 14)                 \
    TYPE(MINUS, 15)                \
    TYPE(STAR, 16)                 \
    TYPE(SLASH, 17)                \
    TYPE(VBAR, 18)                 \
    TYPE(AMPER, 19)                \
    TYPE(LESS, 20)                 \
    TYPE(GREATER, 21)              \
    TYPE(EQUAL, 22)                \
    TYPE(DOT, 23)                  \
    TYPE(PERCENT, 24)              \
    TYPE(BACKQUOTE, 25)            \
    TYPE(LBRACE, 26)               \
    TYPE(RBRACE, 27)               \
    TYPE(EQEQUAL, 28)              \
    TYPE(NOTEQUAL, 29)             \
    TYPE(LESSEQUAL, 30)            \
    TYPE(GREATEREQUAL, 31)         \
    TYPE(TILDE, 32)                \
    TYPE(CIRCUMFLEX, 33)           \
    TYPE(LEFTSHIFT, 34)            \
    TYPE(RIGHTSHIFT, 35)           \
    TYPE(DOUBLESTAR, 36)           \
    TYPE(PLUSEQUAL, 37)            \
    TYPE(MINEQUAL, 38)             \
    TYPE(STAREQUAL, 39)            \
    TYPE(SLASHEQUAL, 40)           \
    TYPE(PERCENTEQUAL, 41)         \
    TYPE(AMPEREQUAL, 42)           \
    TYPE(VBAREQUAL, 43)            \
    TYPE(CIRCUMFLEXEQUAL, 44)      \
    TYPE(LEFTSHIFTEQUAL, 45)       \
    TYPE(RIGHTSHIFTEQUAL, 46)      \
    TYPE(DOUBLESTAREQUAL, 47)      \
    TYPE(DOUBLESLASH, 48)          \
    TYPE(DOUBLESLASHEQUAL, 49)     \
    TYPE(AT, 50)                   \
    TYPE(ATEQUAL, 51)              \
    TYPE(RARROW, 51)               \
    TYPE(ELLIPSIS, 52)             \
    TYPE(COLONEQUAL, 53)           \
    TYPE(ERRORTOKEN, 54)           \
    TYPE(AWAIT, 55)                \
    TYPE(ASYNC, 56)                \
    TYPE(COMMENT, 202)             \
    TYPE(BACKSLASH, 203)

#define CODELOOM_TOKEN_TYPE_CONSTANT(name, number) inline constexpr int16_t kTokenId_##name = number;
CODELOOM_TOKEN_TYPES(CODELOOM_TOKEN_TYPE_CONSTANT)
#undef CODELOOM_TOKEN_TYPE_CONSTANT

struct CTokenTypeName {
    std::string_view name;  // without the prefix "kTokenId_"
    int16_t number;
};

#define CODELOOM_TOKEN_TYPE_ENTRY(name, number) CTokenTypeName{#name, number},
inline constexpr auto kTokenTypeNames =
    std::to_array<CTokenTypeName>({CODELOOM_TOKEN_TYPES(CODELOOM_TOKEN_TYPE_ENTRY)});
#undef CODELOOM_TOKEN_TYPE_ENTRY

constexpr bool IsOpenerType(int type) {
    return type == kTokenId_LPAR || type == kTokenId_LSQB || type == kTokenId_LBRACE;
}

constexpr bool IsCloserType(int type) {
    return type == kTokenId_RPAR || type == kTokenId_RSQB || type == kTokenId_RBRACE;
}

// The type of the token `text`: keywords are names, a row end is kTokenId_NEWLINE, and whatever isn't exactly
// one token of the language is kTokenId_ERRORTOKEN, an empty text too.
int GetTokenType(std::string_view text);

}  // namespace codeloom
