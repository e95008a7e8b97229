// Where the expressions of an f-string or a t-string lie.
#pragma once

#include <cstdint>
#include <string_view>
#include <vector>

#include "syntax/nodes.h"
#include "tokenizer/raw_logical.h"
#include "tokenizer/string_lexer.h"

namespace codeloom {

// `literal` is an f-string or a t-string.
inline bool HasFields(std::string_view literal) {
    return literal.front() != '\'' && literal.front() != '"' && ReadStringStart(literal, 0).has_fields;
}

struct CStringFields {
    std::vector<CSpan> expressions;  // bytes of the file after each "{", by place; nested ones too
    bool has_comment = false;        // within an expression
    int levels = 0;                  // of fields within format specs within fields
    int string_levels = 1;           // of strings within expressions within strings

    bool IsInExpression(uint32_t offset) const;
};

// Requires: the token is a sound f-string or t-string.
CStringFields ReadFields(const CRawLogical& line, const CRawToken& string);

}  // namespace codeloom
