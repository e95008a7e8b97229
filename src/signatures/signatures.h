// signatures/: the functions of a text with their parameters, and all of its type hints.
//   in     the tree of each line, and the hints that are found in it and in its comments
//   out    CSignatures: each with the bytes of the text it is about
//   keeps  nothing
//   start  at CSignatureFinder
#pragma once

#include <cstdint>

#include "syntax/nodes.h"
#include "text/plain_array.h"

namespace codeloom {

// As the interpreter's module `inspect` distinguishes them.
#define CODELOOM_PARAMETER_KINDS(KIND)                  \
    KIND(kPositionalOnly, "positional only")            \
    KIND(kPositionalOrKeyword, "positional or keyword") \
    KIND(kVarPositional, "var positional")              \
    KIND(kKeywordOnly, "keyword only")                  \
    KIND(kVarKeyword, "var keyword")

enum class EParameterKind : uint8_t {
#define CODELOOM_PARAMETER_KIND_ENUM(name, word) name,
    CODELOOM_PARAMETER_KINDS(CODELOOM_PARAMETER_KIND_ENUM)
#undef CODELOOM_PARAMETER_KIND_ENUM
};

// Spans that are empty stand for what isn't there.
struct CSignatureParameter {
    CSpan name;
    CSpan default_value;
    uint32_t hint = UINT32_MAX;  // among the hints
    EParameterKind kind = EParameterKind::kPositionalOrKeyword;
};

struct CSignature {
    CSpan name;
    uint32_t line = 0;
    uint32_t first_parameter = 0;  // up to that of the next signature
    uint32_t return_hint = UINT32_MAX;
    bool is_async = false;
    bool is_method = false;  // right in the body of a class
};

#define CODELOOM_HINT_KINDS(KIND) \
    KIND(kVariable, "variable")   \
    KIND(kAttribute, "attribute") \
    KIND(kParameter, "parameter") \
    KIND(kReturn, "return")

enum class EHintKind : uint8_t {
#define CODELOOM_HINT_KIND_ENUM(name, word) name,
    CODELOOM_HINT_KINDS(CODELOOM_HINT_KIND_ENUM)
#undef CODELOOM_HINT_KIND_ENUM
};

struct CHintInfo {
    CSpan hint;
    CSpan target;  // the name or chain that it is about; of a function for what that returns
    uint32_t line = 0;
    EHintKind kind = EHintKind::kVariable;
    bool in_comment = false;
};

struct CSignatures {
    TPlainArray<CSignature> items;
    TPlainArray<CSignatureParameter> parameters;
    TPlainArray<CHintInfo> hints;  // by place, for each line those of comments after the others

    uint32_t FirstParameter(size_t signature_i) const {
        return signature_i < items.size() ? items[signature_i].first_parameter
                                          : static_cast<uint32_t>(parameters.size());
    }
};

}  // namespace codeloom
