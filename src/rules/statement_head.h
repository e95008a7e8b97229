// How a logical line begins, as far as blocks are concerned. Broken and half-typed lines have a head too: it
// is read from the first words alone.
#pragma once

#include <cstdint>
#include <string_view>

#include "tokenizer/raw_logical.h"

namespace codeloom {

enum class EClause : uint8_t {
    kSimple,
    kDecorator,
    kDef,
    kAsyncDef,
    kClass,
    kIf,
    kElif,
    kElse,
    kFor,
    kAsyncFor,
    kWhile,
    kWith,
    kAsyncWith,
    kTry,
    kExcept,
    kBareExcept,
    kExceptStar,
    kFinally,
    kMatch,
    kCase,
};

// Names in its block are its own.
constexpr bool IsScope(EClause clause) {
    return clause == EClause::kDef || clause == EClause::kAsyncDef || clause == EClause::kClass;
}

constexpr bool IsHandler(EClause clause) {
    return clause == EClause::kExcept || clause == EClause::kBareExcept || clause == EClause::kExceptStar;
}

// A clause that goes on with a statement before it.
constexpr bool IsContinuation(EClause clause) {
    return IsHandler(clause) || clause == EClause::kElif || clause == EClause::kElse ||
           clause == EClause::kFinally;
}

constexpr bool IsDefinition(EClause clause) {
    return clause == EClause::kDef || clause == EClause::kAsyncDef || clause == EClause::kClass ||
           clause == EClause::kDecorator;
}

struct CStatementHead {
    EClause clause = EClause::kSimple;
    uint32_t start = 0;  // bytes of the first token
    uint32_t end = 0;
    bool ends_in_colon = false;      // its last token, comments apart
    bool may_be_annotation = false;  // `case [x]: y`, of a name `case`
    uint32_t with_item_count = 0;

    bool IsHeader() const { return clause > EClause::kDecorator; }
    bool operator==(const CStatementHead&) const = default;
};

// Requires: `logical` isn't a comment.
CStatementHead ReadStatementHead(const CRawLogical& logical);

// What a message calls the statement: "'if' statement", "function definition".
std::string_view NameOfStatement(EClause clause);

// The keyword that the clause begins with.
std::string_view KeywordOf(EClause clause);

}  // namespace codeloom
