#include "neighbours/tokenizer/logical_type.h"

#include <array>
#include <cstddef>
#include <span>
#include <string_view>

#include "neighbours/match_case.h"
#include "neighbours/token_type.h"
#include "neighbours/tokenizer/keywords.h"

namespace codeloom {

namespace {

struct CKeywordType {
    std::string_view keyword;
    ELogicalType type;
};

constexpr auto kKeywordTypes = std::to_array<CKeywordType>({
    {"if", ELogicalType::kIfBeginning},
    {"def", ELogicalType::kFunctionDef},
    {"return", ELogicalType::kReturn},
    {"for", ELogicalType::kForBeginning},
    {"else", ELogicalType::kElseBeginning},
    {"class", ELogicalType::kClassDef},
    {"elif", ELogicalType::kElifBeginning},
    {"import", ELogicalType::kImport},
    {"from", ELogicalType::kFromImport},
    {"raise", ELogicalType::kRaise},
    {"try", ELogicalType::kTry},
    {"except", ELogicalType::kExcept},
    {"pass", ELogicalType::kPass},
    {"with", ELogicalType::kWith},
    {"while", ELogicalType::kWhileBeginning},
    {"assert", ELogicalType::kAssert},
    {"continue", ELogicalType::kContinue},
    {"break", ELogicalType::kBreak},
    {"finally", ELogicalType::kFinally},
    {"del", ELogicalType::kDelete},
});

bool IsSkipped(const CRawToken& token) {
    return token.type == kTokenId_COMMENT || token.type == kTokenId_BACKSLASH;
}

// The index of the first token from `token_i` on that is neither a comment nor a backslash; the number of
// tokens when there is none.
size_t FindSignificant(const std::vector<CRawToken>& tokens, size_t token_i) {
    while (token_i < tokens.size() && IsSkipped(tokens[token_i])) ++token_i;
    return token_i;
}

ELogicalType TypeOfKeyword(std::string_view word) {
    if (word.size() < 2 || word.size() > 8) return ELogicalType::kUnknown;
    for (const CKeywordType& entry : kKeywordTypes) {
        if (entry.keyword == word) return entry.type;
    }
    return ELogicalType::kUnknown;
}

ELogicalType TypeOfMatchOrCase(const std::vector<CRawToken>& tokens) {
    std::vector<std::string_view> texts;
    texts.reserve(tokens.size());
    for (const CRawToken& token : tokens) texts.push_back(token.text);
    return FindMatchOrCaseType(texts, 0, texts.size());
}

// `async` before `def`, `for` or `with`.
ELogicalType TypeOfAsync(const std::vector<CRawToken>& tokens, size_t async_i) {
    const size_t next_i = FindSignificant(tokens, async_i + 1);
    if (next_i == tokens.size()) return ELogicalType::kUnknown;
    const std::string_view next = tokens[next_i].text;
    return next == "def" || next == "for" || next == "with" ? TypeOfKeyword(next) : ELogicalType::kUnknown;
}

// An operand that can directly follow the print of Python 2, but no operand.
bool IsPrinted(const CRawToken& token) {
    if (token.type == kTokenId_NAME)
        return !keywords::IsOneOf(token.text, keywords::kBinary) || token.text == "not";
    return token.type == kTokenId_STRING || token.type == kTokenId_NUMBER ||
           token.type == kTokenId_BACKQUOTE || token.type == kTokenId_LBRACE ||
           token.type == kTokenId_TILDE || token.type == kTokenId_RIGHTSHIFT;
}

// The soft keywords; kUnknown for a plain name.
ELogicalType TypeOfSoftKeyword(const std::vector<CRawToken>& tokens, size_t word_i) {
    const std::string_view word = tokens[word_i].text;
    if (word == "async") return TypeOfAsync(tokens, word_i);
    if (word == "match" || word == "case") return TypeOfMatchOrCase(tokens);
    if (word != "print" && word != "type") return ELogicalType::kUnknown;
    const size_t next_i = FindSignificant(tokens, word_i + 1);
    if (next_i == tokens.size()) return ELogicalType::kUnknown;
    if (word == "print") return IsPrinted(tokens[next_i]) ? ELogicalType::kPrint : ELogicalType::kUnknown;
    const bool is_named =
        tokens[next_i].type == kTokenId_NAME && !keywords::IsOneOf(tokens[next_i].text, keywords::kBinary);
    return is_named ? ELogicalType::kTypeStatement : ELogicalType::kUnknown;
}

// An assignment sign outside brackets that isn't a lambda's.
bool HasAssignment(const std::vector<CRawToken>& tokens) {
    int depth = 0;
    int open_lambdas = 0;
    for (const CRawToken& token : tokens) {
        const EByteKind kind = ByteKind(token.text[0]);
        if (kind == EByteKind::kOpener) ++depth;
        if (kind == EByteKind::kCloser) --depth;
        if (depth != 0) continue;
        if (kind == EByteKind::kNameStart && token.text == "lambda") ++open_lambdas;
        if (kind != EByteKind::kOperator || !IsAssignmentOperator(token)) continue;
        if (open_lambdas == 0) return true;
        if (token.type == kTokenId_COLON) --open_lambdas;
    }
    return false;
}

bool IsStringAlone(const std::vector<CRawToken>& tokens) {
    for (const CRawToken& token : tokens) {
        if (token.type != kTokenId_STRING && !IsSkipped(token)) return false;
    }
    return true;
}

}  // namespace

const CRawToken* FindFirstSignificant(const std::vector<CRawToken>& tokens) {
    const size_t first_i = FindSignificant(tokens, 0);
    return first_i == tokens.size() ? nullptr : &tokens[first_i];
}

// "->" has the number of "@=".
bool IsAssignmentOperator(const CRawToken& token) {
    const int16_t type = token.type;
    return type == kTokenId_EQUAL || type == kTokenId_COLON ||
           (type == kTokenId_ATEQUAL && token.text != "->") ||
           (type >= kTokenId_PLUSEQUAL && type <= kTokenId_DOUBLESTAREQUAL) ||
           type == kTokenId_DOUBLESLASHEQUAL;
}

ELogicalType FindLogicalType(const std::vector<CRawToken>& tokens) {
    const size_t first_i = FindSignificant(tokens, 0);
    if (first_i == tokens.size()) return ELogicalType::kUnknown;
    const CRawToken& first = tokens[first_i];
    if (first.type == kTokenId_ERRORTOKEN) return ELogicalType::kErrorTokenPrefix;
    if (first.type == kTokenId_STRING && IsStringAlone(tokens)) return ELogicalType::kStringExpression;
    if (first.type == kTokenId_NAME) {
        const ELogicalType keyword_type = TypeOfKeyword(first.text);
        if (keyword_type != ELogicalType::kUnknown) return keyword_type;
        const ELogicalType soft_type = TypeOfSoftKeyword(tokens, first_i);
        if (soft_type != ELogicalType::kUnknown) return soft_type;
    }
    return HasAssignment(tokens) ? ELogicalType::kAssignment : ELogicalType::kUnknown;
}

bool IsCompound(const std::vector<CRawToken>& tokens) {
    switch (FindLogicalType(tokens)) {
        case ELogicalType::kClassDef:
        case ELogicalType::kFunctionDef:
        case ELogicalType::kIfBeginning:
        case ELogicalType::kElifBeginning:
        case ELogicalType::kElseBeginning:
        case ELogicalType::kWhileBeginning:
        case ELogicalType::kForBeginning:
        case ELogicalType::kTry:
        case ELogicalType::kExcept:
        case ELogicalType::kFinally:
        case ELogicalType::kWith:
        case ELogicalType::kMatch:
        case ELogicalType::kCase:
            return true;
        default:
            return false;
    }
}

}  // namespace codeloom
