// The operators and brackets of all language versions: which is the longest one at a place, and its number.
#pragma once

#include <array>
#include <cstddef>
#include <cstdint>
#include <string_view>

#include "neighbours/token_type.h"
#include "neighbours/tokenizer/char_class.h"

namespace codeloom {

struct COperator {
    int16_t type = kTokenId_ERRORTOKEN;
    uint8_t length = 0;  // zero where no operator stands
};

// The types of an operator byte alone, doubled, with "=" behind it, and doubled with "=" behind it; zero
// where that isn't an operator.
struct COperatorForms {
    uint8_t single = 0, doubled = 0, with_equal = 0, doubled_with_equal = 0;
};

inline constexpr std::array<COperatorForms, 128> kOperatorForms = [] {
    std::array<COperatorForms, 128> forms{};
    forms['('].single = kTokenId_LPAR;
    forms[')'].single = kTokenId_RPAR;
    forms['['].single = kTokenId_LSQB;
    forms[']'].single = kTokenId_RSQB;
    forms['{'].single = kTokenId_LBRACE;
    forms['}'].single = kTokenId_RBRACE;
    forms[','].single = kTokenId_COMMA;
    forms[';'].single = kTokenId_SEMI;
    forms['`'].single = kTokenId_BACKQUOTE;
    forms['~'].single = kTokenId_TILDE;
    forms['.'].single = kTokenId_DOT;
    forms[':'] = {kTokenId_COLON, 0, kTokenId_COLONEQUAL, 0};
    forms['!'] = {0, 0, kTokenId_NOTEQUAL, 0};
    forms['='] = {kTokenId_EQUAL, kTokenId_EQEQUAL, 0, 0};
    forms['+'] = {kTokenId_PLUS, 0, kTokenId_PLUSEQUAL, 0};
    forms['-'] = {kTokenId_MINUS, 0, kTokenId_MINEQUAL, 0};
    forms['%'] = {kTokenId_PERCENT, 0, kTokenId_PERCENTEQUAL, 0};
    forms['@'] = {kTokenId_AT, 0, kTokenId_ATEQUAL, 0};
    forms['&'] = {kTokenId_AMPER, 0, kTokenId_AMPEREQUAL, 0};
    forms['|'] = {kTokenId_VBAR, 0, kTokenId_VBAREQUAL, 0};
    forms['^'] = {kTokenId_CIRCUMFLEX, 0, kTokenId_CIRCUMFLEXEQUAL, 0};
    forms['*'] = {kTokenId_STAR, kTokenId_DOUBLESTAR, kTokenId_STAREQUAL, kTokenId_DOUBLESTAREQUAL};
    forms['/'] = {kTokenId_SLASH, kTokenId_DOUBLESLASH, kTokenId_SLASHEQUAL, kTokenId_DOUBLESLASHEQUAL};
    forms['<'] = {kTokenId_LESS, kTokenId_LEFTSHIFT, kTokenId_LESSEQUAL, kTokenId_LEFTSHIFTEQUAL};
    forms['>'] = {kTokenId_GREATER, kTokenId_RIGHTSHIFT, kTokenId_GREATEREQUAL, kTokenId_RIGHTSHIFTEQUAL};
    return forms;
}();

// The longest operator at `pos`.
inline COperator OperatorAt(std::string_view text, size_t pos) {
    const char first = ByteAt(text, pos);
    if (!IsAscii(first)) return {};
    const char second = ByteAt(text, pos + 1);
    if (first == '-' && second == '>') return {kTokenId_RARROW, 2};
    if (first == '<' && second == '>') return {kTokenId_NOTEQUAL, 2};
    if (first == '.' && second == '.' && ByteAt(text, pos + 2) == '.') return {kTokenId_ELLIPSIS, 3};
    const COperatorForms& forms = kOperatorForms[static_cast<size_t>(first)];
    if (second == '=' && forms.with_equal) return {forms.with_equal, 2};
    if (second == first && forms.doubled) {
        if (forms.doubled_with_equal && ByteAt(text, pos + 2) == '=') return {forms.doubled_with_equal, 3};
        return {forms.doubled, 2};
    }
    if (forms.single) return {forms.single, 1};
    return {};
}

}  // namespace codeloom
