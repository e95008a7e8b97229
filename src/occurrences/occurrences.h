// Every appearance of a name in a text, as plain data.
#pragma once

#include <cstdint>
#include <memory>
#include <string_view>
#include <type_traits>

#include "names/name_table.h"
#include "text/move_bytes.h"
#include "text/plain_array.h"

namespace codeloom {

// What a name does where it appears: the word that hosts see, and what it means.
#define CODELOOM_ROLES(ROLE)                                                                              \
    ROLE(kRead, "read", "the value is asked for")                                                         \
    ROLE(kBind, "bind", "gets a value: a target, a definition's name, a capture; also if annotated only") \
    ROLE(kAugment, "augment", "target of `x += 1`")                                                       \
    ROLE(kDelete, "delete", "target of `del`")                                                            \
    ROLE(kImport, "import", "bound by an import, `*` too")                                                \
    ROLE(kParameter, "parameter", "of a `def` or a `lambda`")                                             \
    ROLE(kTypeParameter, "type parameter", "of a definition or an alias (PEP 695)")                       \
    ROLE(kGlobal, "global", "declared so")                                                                \
    ROLE(kNonlocal, "nonlocal", "declared so")                                                            \
    ROLE(kAttribute, "attribute", "`b` of `a.b`, read")                                                   \
    ROLE(kAttributeBind, "attribute bind", "`b` of `a.b = 1`")                                            \
    ROLE(kAttributeAugment, "attribute augment", "`b` of `a.b += 1`")                                     \
    ROLE(kAttributeDelete, "attribute delete", "`b` of `del a.b`")                                        \
    ROLE(kKeyword, "keyword", "names an argument of a call, a class or a class pattern")                  \
    ROLE(kOrigin, "origin", "named by an import that binds another name, or a part of this one")

enum class ERole : uint8_t {
#define CODELOOM_ROLE_ENUM(name, word, meaning) name,
    CODELOOM_ROLES(CODELOOM_ROLE_ENUM)
#undef CODELOOM_ROLE_ENUM
};

// True for names that belong to a scope; attributes, keywords and origins belong to none.
constexpr bool IsScoped(ERole role) {
    return role <= ERole::kNonlocal;
}

// True where the name gets a value.
constexpr bool IsBinding(ERole role) {
    return role == ERole::kBind || role == ERole::kAugment || role == ERole::kImport ||
           role == ERole::kParameter || role == ERole::kTypeParameter;
}

#define CODELOOM_SCOPE_KINDS(KIND)                                                       \
    KIND(kModule, "module", "")                                                          \
    KIND(kClass, "class", "")                                                            \
    KIND(kFunction, "function", "")                                                      \
    KIND(kLambda, "lambda", "")                                                          \
    KIND(kListComprehension, "list comprehension", "")                                   \
    KIND(kSetComprehension, "set comprehension", "")                                     \
    KIND(kDictComprehension, "dict comprehension", "")                                   \
    KIND(kGenerator, "generator", "")                                                    \
    KIND(kTypeParameters, "type parameters", "around a generic definition or alias")     \
    KIND(kTypeAlias, "type alias", "the value of `type X = ...`")                        \
    KIND(kTypeVariable, "type variable", "the bound or the default of a type parameter") \
    KIND(kAnnotation, "annotation", "evaluated later, or never")

enum class EScopeKind : uint8_t {
#define CODELOOM_SCOPE_KIND_ENUM(name, word, meaning) name,
    CODELOOM_SCOPE_KINDS(CODELOOM_SCOPE_KIND_ENUM)
#undef CODELOOM_SCOPE_KIND_ENUM
};

constexpr bool IsComprehensionScope(EScopeKind kind) {
    return kind >= EScopeKind::kListComprehension && kind <= EScopeKind::kGenerator;
}

struct COccurrence {
    // Where the name appears, and how.
    enum EFlag : uint8_t {
        kInField = 1,        // within a field of an f-string
        kInQuotes = 2,       // within a hint in quotes
        kInComment = 4,      // within a hint in a comment
        kIsAnnotated = 8,    // the target of an annotation, as a bare name
        kIsWalrus = 16,      // bound by `:=`
        kIsDefinition = 32,  // the name of a `def` or a `class`
        kIsIdle = 64,        // annotated in parentheses, without a value: the interpreter passes over it
    };

    uint32_t name = 0;   // in the table of names
    uint32_t start = 0;  // bytes of the file
    uint32_t end = 0;
    uint32_t object_start = 0;  // what an attribute hangs on; equal for all else
    uint32_t object_end = 0;
    uint32_t scope =
        0;  // zero: that around the line; otherwise the count of the line's inner scopes up to it
    ERole role = ERole::kRead;
    uint8_t flags = 0;

    // To other bytes, with what it hangs on.
    void Move(uint32_t shift) {
        MoveBytes(*this, shift);
        if (object_start == object_end) return;
        object_start += shift;
        object_end += shift;
    }
};

static_assert(std::is_trivially_copyable_v<COccurrence>);

// A scope that begins on a line, in the order of the source.
struct CInnerScope {
    EScopeKind kind = EScopeKind::kFunction;
    bool is_lost = false;      // its header has a fault: what it binds isn't known
    bool is_text = false;      // annotations that are kept as text, which no code is made of
    bool is_of_class = false;  // type parameters of a class
    uint32_t name = 0;         // of a definition or alias; number of the empty name for others
    uint32_t parent = 0;       // counted like the scope of an occurrence
    uint32_t start = 0;        // bytes of its header or expression
    uint32_t end = 0;
};

// Those of one or many lines.
struct COccurrences {
    TPlainArray<COccurrence> items;
    TPlainArray<CInnerScope> scopes;
    std::shared_ptr<CNameTable> names = std::make_shared<CNameTable>();  // others may share it

    std::string_view Name(const COccurrence& occurrence) const { return names->Text(occurrence.name); }
};

}  // namespace codeloom
