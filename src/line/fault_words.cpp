#include "line/fault_words.h"

#include <cassert>

#include "syntax/forms.h"

namespace codeloom {

namespace {

std::string InvalidSyntaxIn(ELogicalType part) {
    switch (part) {
        case ELogicalType::kCommentedTypeHint:
            return "invalid syntax in commented type hint";
        case ELogicalType::kStringifiedTypeHint:
            return "invalid syntax in stringified type hint";
        default:
            return "invalid syntax";
    }
}

}  // namespace

const CRawLogical& PartAtFault(const CFault& fault, const CRawLogical& line) {
    return fault.embedded_i < 0 ? line : line.embedded[static_cast<size_t>(fault.embedded_i)];
}

std::string MessageOf(const CFault& fault, const CRawLogical& line) {
    assert(fault && fault.kind != EFault::kTooLong);
    switch (fault.kind) {
        case EFault::kNewerForm:
            return MessageOf(*fault.form);
        case EFault::kBareGenerator:
            return "Generator expression must be parenthesized if not sole argument";
        case EFault::kExceptTarget:
            return "Name in except clause must be a simple name";
        case EFault::kInvalidHint:
            return "invalid syntax";
        default:
            return InvalidSyntaxIn(PartAtFault(fault, line).type);
    }
}

CSpan PlaceOf(const CFault& fault, const CRawLogical& line) {
    const CRawLogical& part = PartAtFault(fault, line);
    assert(!part.tokens.empty());
    if (fault.token_i >= part.tokens.size()) {
        const uint32_t end = part.EndOf(part.tokens.back());
        return {end, end};
    }
    const CRawToken& token = part.tokens[fault.token_i];
    return {part.StartOf(token) + fault.byte_in_token, part.EndOf(token)};
}

}  // namespace codeloom
