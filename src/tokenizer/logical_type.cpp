#include "tokenizer/logical_type.h"

#include <array>
#include <cstddef>

#include "text/token_type.h"
#include "tokenizer/keywords.h"
#include "tokenizer/match_case.h"

namespace codeloom {

namespace {

// The types of the lines that begin with a keyword; kUnknown for other words.
constexpr auto kTypeOfKeyword = [] {
    std::array<ELogicalType, static_cast<size_t>(EWord::kCount)> types{};
    const auto set = [&types](EWord word, ELogicalType type) { types[static_cast<size_t>(word)] = type; };
    set(EWord::kIf, ELogicalType::kIfBeginning);
    set(EWord::kDef, ELogicalType::kFunctionDef);
    set(EWord::kReturn, ELogicalType::kReturn);
    set(EWord::kFor, ELogicalType::kForBeginning);
    set(EWord::kElse, ELogicalType::kElseBeginning);
    set(EWord::kClass, ELogicalType::kClassDef);
    set(EWord::kElif, ELogicalType::kElifBeginning);
    set(EWord::kImport, ELogicalType::kImport);
    set(EWord::kFrom, ELogicalType::kFromImport);
    set(EWord::kRaise, ELogicalType::kRaise);
    set(EWord::kTry, ELogicalType::kTry);
    set(EWord::kExcept, ELogicalType::kExcept);
    set(EWord::kPass, ELogicalType::kPass);
    set(EWord::kWith, ELogicalType::kWith);
    set(EWord::kWhile, ELogicalType::kWhileBeginning);
    set(EWord::kAssert, ELogicalType::kAssert);
    set(EWord::kContinue, ELogicalType::kContinue);
    set(EWord::kBreak, ELogicalType::kBreak);
    set(EWord::kFinally, ELogicalType::kFinally);
    set(EWord::kDel, ELogicalType::kDelete);
    return types;
}();
static_assert(kTypeOfKeyword[0] == ELogicalType::kUnknown);

ELogicalType TypeOfKeyword(EWord word) {
    return kTypeOfKeyword[static_cast<size_t>(word)];
}

// The next token that is neither a comment nor a backslash, after one of the logical's; none when there is
// none.
const CRawToken* FindNextSignificant(const CRawLogical& logical, const CRawToken& token) {
    const CRawToken* const end = logical.tokens.data() + logical.tokens.size();
    for (const CRawToken* next = &token + 1; next != end; ++next) {
        if (!IsPassedOver(*next)) return next;
    }
    return nullptr;
}

// `async` before `def`, `for` or `with`.
ELogicalType TypeOfAsync(EWord next) {
    const bool is_header = next == EWord::kDef || next == EWord::kFor || next == EWord::kWith;
    return is_header ? TypeOfKeyword(next) : ELogicalType::kUnknown;
}

// An operand that can directly follow the print of Python 2, but no operand.
bool IsPrinted(const CRawToken& token) {
    if (token.type == kTokenId_NAME) return !IsBinaryWord(token.word) || token.word == EWord::kNot;
    return token.type == kTokenId_STRING || token.type == kTokenId_NUMBER ||
           token.type == kTokenId_BACKQUOTE || token.type == kTokenId_LBRACE ||
           token.type == kTokenId_TILDE || token.type == kTokenId_RIGHTSHIFT;
}

// The type of a line that begins with a soft keyword; kUnknown where that is a plain name.
ELogicalType TypeOfSoftKeyword(const CRawLogical& logical, const CRawToken& token) {
    const EWord word = token.word;
    if (word == EWord::kMatch || word == EWord::kCase)
        return FindMatchOrCaseType(logical.tokens, logical.file_text);
    const CRawToken* next = FindNextSignificant(logical, token);
    if (!next) return ELogicalType::kUnknown;
    switch (word) {
        case EWord::kAsync:
            return TypeOfAsync(next->word);
        case EWord::kPrint:
            return IsPrinted(*next) ? ELogicalType::kPrint : ELogicalType::kUnknown;
        case EWord::kType: {
            const bool is_named = next->type == kTokenId_NAME && !IsBinaryWord(next->word);
            return is_named ? ELogicalType::kTypeStatement : ELogicalType::kUnknown;
        }
        default:
            return ELogicalType::kUnknown;
    }
}

bool IsStringAlone(const std::vector<CRawToken>& tokens) {
    for (const CRawToken& token : tokens) {
        if (token.type != kTokenId_STRING && !IsPassedOver(token)) return false;
    }
    return true;
}

}  // namespace

const CRawToken* FindFirstSignificant(const std::vector<CRawToken>& tokens) {
    for (const CRawToken& token : tokens) {
        if (!IsPassedOver(token)) return &token;
    }
    return nullptr;
}

CRawToken FindLastSignificant(const std::vector<CRawToken>& tokens) {
    for (auto token = tokens.rbegin(); token != tokens.rend(); ++token) {
        if (!IsPassedOver(*token)) return *token;
    }
    return {};
}

ELogicalType TypeOfBeginning(const CRawLogical& logical) {
    const CRawToken* first = FindFirstSignificant(logical.tokens);
    if (!first) return ELogicalType::kUnknown;
    if (first->word != EWord::kNone && first->type == kTokenId_NAME) {
        const ELogicalType keyword_type = TypeOfKeyword(first->word);
        return keyword_type != ELogicalType::kUnknown ? keyword_type : TypeOfSoftKeyword(logical, *first);
    }
    if (first->type == kTokenId_ERRORTOKEN) return ELogicalType::kErrorTokenPrefix;
    const bool is_string = first->type == kTokenId_STRING && IsStringAlone(logical.tokens);
    return is_string ? ELogicalType::kStringExpression : ELogicalType::kUnknown;
}

bool IsCompound(const CRawLogical& logical) {
    switch (TypeOfBeginning(logical)) {
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
