// What is wrong with one logical line, as plain data. Upper layers turn it into words and places.
#pragma once

#include <cstdint>

namespace codeloom {

struct CForm;  // a form of the language with the version that has it (syntax/forms.h)

enum class EFault : uint8_t {
    kNone,
    kInvalidSyntax,
    kInvalidHint,    // in a comment
    kNewerForm,      // `form` says what, and the version that it needs or that it ended with
    kBareGenerator,  // Generator expression must be parenthesized if not sole argument
    kExceptTarget,   // Name in except clause must be a simple name
    kTooLong,        // the line isn't analysed
};

struct CFault {
    EFault kind = EFault::kNone;
    const CForm* form = nullptr;
    int32_t embedded_i = -1;     // the embedded logical at fault; -1 for the line itself
    uint32_t token_i = 0;        // in that logical; its token count for the place after its end
    uint32_t byte_in_token = 0;  // where a hint within a comment token is at fault

    explicit operator bool() const { return kind != EFault::kNone; }
};

}  // namespace codeloom
