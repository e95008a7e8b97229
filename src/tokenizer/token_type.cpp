#include "text/token_type.h"

#include "text/unicode_names.h"
#include "tokenizer/number_lexer.h"
#include "tokenizer/operators.h"
#include "tokenizer/string_lexer.h"

namespace codeloom {

namespace {

int StringType(std::string_view text, const CStringStart& start) {
    return IsClosedString(text, start) ? kTokenId_STRING : kTokenId_ERRORTOKEN;
}

int NameOrStringType(std::string_view text) {
    const size_t name_end = NameEnd(text, 0);
    if (name_end == text.size()) return kTokenId_NAME;
    if (name_end > 2 || ByteKind(text[name_end]) != EByteKind::kQuote) return kTokenId_ERRORTOKEN;
    const CStringStart start = ReadStringStart(text, 0);
    return start.quote_length ? StringType(text, start) : kTokenId_ERRORTOKEN;
}

int NumberType(std::string_view text) {
    return NumberEnd(text, 0) == text.size() ? kTokenId_NUMBER : kTokenId_ERRORTOKEN;
}

int OperatorType(std::string_view text) {
    const COperator op = OperatorAt(text, 0);
    return op.length == text.size() ? op.type : kTokenId_ERRORTOKEN;
}

}  // namespace

int GetTokenType(std::string_view text) {
    if (text.empty()) return kTokenId_ERRORTOKEN;
    switch (ByteKind(text[0])) {
        case EByteKind::kNameStart:
            return NameOrStringType(text);
        case EByteKind::kDigit:
            return NumberType(text);
        case EByteKind::kQuote:
            return StringType(text, ReadStringStart(text, 0));
        case EByteKind::kDot:
            return IsDigit(ByteAt(text, 1)) ? NumberType(text) : OperatorType(text);
        case EByteKind::kComment:
            return kTokenId_COMMENT;
        case EByteKind::kBackslash:
            return text.size() == 1 ? kTokenId_BACKSLASH : kTokenId_ERRORTOKEN;
        case EByteKind::kRowEnd:
            return RowEndLength(text, 0) == text.size() ? kTokenId_NEWLINE : kTokenId_ERRORTOKEN;
        default:
            return OperatorType(text);
    }
}

}  // namespace codeloom
