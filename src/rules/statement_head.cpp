#include "rules/statement_head.h"

#include <array>
#include <span>
#include <vector>

#include "text/token_type.h"
#include "tokenizer/keywords.h"

namespace codeloom {

namespace {

struct CClauseNames {
    std::string_view keyword;
    std::string_view statement;
};

// By EClause.
constexpr auto kClauseNames = std::to_array<CClauseNames>({
    {"", "statement"},
    {"@", "decorator"},
    {"def", "function definition"},
    {"async def", "function definition"},
    {"class", "class definition"},
    {"if", "'if' statement"},
    {"elif", "'elif' statement"},
    {"else", "'else' statement"},
    {"for", "'for' statement"},
    {"async for", "'for' statement"},
    {"while", "'while' statement"},
    {"with", "'with' statement"},
    {"async with", "'with' statement"},
    {"try", "'try' statement"},
    {"except", "'except' statement"},
    {"except", "'except' statement"},
    {"except*", "'except*' statement"},
    {"finally", "'finally' statement"},
    {"match", "'match' statement"},
    {"case", "'case' statement"},
});

// The tokens from `token_i` on, passing over comments and backslashes; null at the end.
const CRawToken* NextSignificant(std::span<const CRawToken> tokens, size_t& token_i) {
    while (token_i < tokens.size()) {
        const CRawToken& token = tokens[token_i++];
        if (!IsPassedOver(token)) return &token;
    }
    return nullptr;
}

constexpr uint64_t kWordsOfClauses = WordBits(
    EWord::kAsync, EWord::kCase, EWord::kClass, EWord::kDef, EWord::kElif, EWord::kElse, EWord::kExcept,
    EWord::kFinally, EWord::kFor, EWord::kIf, EWord::kMatch, EWord::kTry, EWord::kWhile, EWord::kWith);

bool EndsInColon(const std::vector<CRawToken>& tokens) {
    for (auto token = tokens.rbegin(); token != tokens.rend(); ++token)
        if (!IsPassedOver(*token)) return token->type == kTokenId_COLON;
    return false;
}

EClause ClauseOfExcept(const CRawToken* next) {
    if (next != nullptr && next->type == kTokenId_STAR) return EClause::kExceptStar;
    return next == nullptr || next->type == kTokenId_COLON ? EClause::kBareExcept : EClause::kExcept;
}

EClause ClauseOfAsync(const CRawToken* next) {
    switch (next == nullptr ? EWord::kNone : next->word) {
        case EWord::kDef:
            return EClause::kAsyncDef;
        case EWord::kFor:
            return EClause::kAsyncFor;
        case EWord::kWith:
            return EClause::kAsyncWith;
        default:
            return EClause::kSimple;
    }
}

EClause ClauseOfWord(EWord word) {
    switch (word) {
        case EWord::kDef:
            return EClause::kDef;
        case EWord::kClass:
            return EClause::kClass;
        case EWord::kIf:
            return EClause::kIf;
        case EWord::kElif:
            return EClause::kElif;
        case EWord::kElse:
            return EClause::kElse;
        case EWord::kFor:
            return EClause::kFor;
        case EWord::kWhile:
            return EClause::kWhile;
        case EWord::kWith:
            return EClause::kWith;
        case EWord::kTry:
            return EClause::kTry;
        case EWord::kFinally:
            return EClause::kFinally;
        default:
            return EClause::kSimple;
    }
}

// The items of a `with`, in parentheses or not.
uint32_t CountWithItems(const CRawLogical& logical) {
    uint32_t count_outside = 1, count_inside = 1;
    int depth = 0;
    bool is_in_parentheses = true;  // all of it
    size_t token_i = 0;
    while (const CRawToken* const token = NextSignificant(logical.tokens, token_i)) {
        if (token->word == EWord::kWith || token->word == EWord::kAsync) continue;
        if (depth == 0 && token->type == kTokenId_COLON) break;
        is_in_parentheses &= depth > 0 || token->type == kTokenId_LPAR || token->type == kTokenId_RPAR;
        if (token->type == kTokenId_COMMA) (depth == 0 ? count_outside : count_inside) += depth < 2;
        depth += IsOpenerType(token->type) - IsCloserType(token->type);
    }
    return is_in_parentheses ? count_inside : count_outside;
}

// `case [x]: y`, of which the tokens from `token_i` on come after the first word.
bool MayBeAnnotation(std::span<const CRawToken> tokens, size_t token_i) {
    const CRawToken* token = NextSignificant(tokens, token_i);
    if (token == nullptr || token->type != kTokenId_LSQB) return false;
    for (int depth = 0; token != nullptr; token = NextSignificant(tokens, token_i)) {
        depth += IsOpenerType(token->type) - IsCloserType(token->type);
        if (depth == 0 && token->type == kTokenId_COLON) break;
    }
    const CRawToken* const annotation = NextSignificant(tokens, token_i);
    return annotation != nullptr && !IsStatementWord(annotation->word);
}

}  // namespace

CStatementHead ReadStatementHead(const CRawLogical& logical) {
    const CRawToken& beginning = logical.tokens.front();
    const bool may_have_clause = (WordBits(beginning.word) & kWordsOfClauses) != 0 ||
                                 beginning.type == kTokenId_AT || IsPassedOver(beginning);
    if (!may_have_clause)
        return {.start = logical.StartOf(beginning),
                .end = logical.EndOf(beginning),
                .ends_in_colon = EndsInColon(logical.tokens)};
    CStatementHead head;
    size_t token_i = 0;
    const CRawToken* const significant = NextSignificant(logical.tokens, token_i);
    const CRawToken* const first = significant == nullptr ? &logical.tokens.front() : significant;
    head.start = logical.StartOf(*first);
    head.end = logical.EndOf(*first);
    if (significant == nullptr) return head;
    if (first->type == kTokenId_AT) {
        head.clause = EClause::kDecorator;
    } else if (logical.type == ELogicalType::kMatch || logical.type == ELogicalType::kCase) {
        head.clause = logical.type == ELogicalType::kMatch ? EClause::kMatch : EClause::kCase;
    } else if (first->word == EWord::kExcept) {
        head.clause = ClauseOfExcept(NextSignificant(logical.tokens, token_i));
    } else if (first->word == EWord::kAsync) {
        head.clause = ClauseOfAsync(NextSignificant(logical.tokens, token_i));
    } else {
        head.clause = ClauseOfWord(first->word);
    }
    if (head.clause == EClause::kCase) head.may_be_annotation = MayBeAnnotation(logical.tokens, token_i);
    if (head.clause == EClause::kWith || head.clause == EClause::kAsyncWith)
        head.with_item_count = CountWithItems(logical);
    head.ends_in_colon = EndsInColon(logical.tokens);
    return head;
}

std::string_view NameOfStatement(EClause clause) {
    return kClauseNames[static_cast<size_t>(clause)].statement;
}

std::string_view KeywordOf(EClause clause) {
    return kClauseNames[static_cast<size_t>(clause)].keyword;
}

}  // namespace codeloom
