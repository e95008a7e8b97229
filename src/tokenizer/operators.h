// The operators and brackets of all language versions: which is the longest one at a place, and its number.
#pragma once

#include <array>
#include <cstddef>
#include <cstdint>
#include <string_view>

#include "text/char_class.h"
#include "text/token_type.h"
#include "text/words.h"

namespace codeloom {

struct COperator {
    int16_t type = kTokenId_ERRORTOKEN;
    uint8_t length = 0;         // zero where there is no operator
    EWord word = EWord::kNone;  // of operators that share their type
};

// The types of an operator byte alone, doubled, with "=" after it, and doubled with "=" after it; zero
// where that isn't an operator.
struct COperatorForms {
    uint8_t single = 0, doubled = 0, with_equal = 0, doubled_with_equal = 0;
    EWord word_with_equal = EWord::kNone;
};

inline constexpr std::array<COperatorForms, 256> kOperatorForms = [] {
    std::array<COperatorForms, 256> forms{};
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
    forms['!'] = {0, 0, kTokenId_NOTEQUAL, 0, EWord::kNotEqual};
    forms['='] = {kTokenId_EQUAL, kTokenId_EQEQUAL, 0, 0};
    forms['+'] = {kTokenId_PLUS, 0, kTokenId_PLUSEQUAL, 0};
    forms['-'] = {kTokenId_MINUS, 0, kTokenId_MINEQUAL, 0};
    forms['%'] = {kTokenId_PERCENT, 0, kTokenId_PERCENTEQUAL, 0};
    forms['@'] = {kTokenId_AT, 0, kTokenId_ATEQUAL, 0, EWord::kMatrixAssign};
    forms['&'] = {kTokenId_AMPER, 0, kTokenId_AMPEREQUAL, 0};
    forms['|'] = {kTokenId_VBAR, 0, kTokenId_VBAREQUAL, 0};
    forms['^'] = {kTokenId_CIRCUMFLEX, 0, kTokenId_CIRCUMFLEXEQUAL, 0};
    forms['*'] = {kTokenId_STAR, kTokenId_DOUBLESTAR, kTokenId_STAREQUAL, kTokenId_DOUBLESTAREQUAL};
    forms['/'] = {kTokenId_SLASH, kTokenId_DOUBLESLASH, kTokenId_SLASHEQUAL, kTokenId_DOUBLESLASHEQUAL};
    forms['<'] = {kTokenId_LESS, kTokenId_LEFTSHIFT, kTokenId_LESSEQUAL, kTokenId_LEFTSHIFTEQUAL};
    forms['>'] = {kTokenId_GREATER, kTokenId_RIGHTSHIFT, kTokenId_GREATEREQUAL, kTokenId_RIGHTSHIFTEQUAL};
    return forms;
}();

constexpr int16_t BracketType(char c) {
    return kOperatorForms[static_cast<unsigned char>(c)].single;
}

// The operator that the byte is by itself.
inline COperator SingleOperator(char c) {
    const uint8_t type = kOperatorForms[static_cast<unsigned char>(c)].single;
    return type ? COperator{type, 1} : COperator();
}

// The longest operator of at least two bytes at `pos`, or else that of one byte.
COperator LongOperatorAt(std::string_view text, size_t pos);

// The longest operator at `pos`.
inline COperator OperatorAt(std::string_view text, size_t pos) {
    if (HasTrait(ByteAt(text, pos + 1), kContinuesOperator)) return LongOperatorAt(text, pos);
    return SingleOperator(ByteAt(text, pos));
}

}  // namespace codeloom
