#include "face/kinds.h"

#include <array>
#include <string>

#include "names/record_kinds.h"

namespace codeloom {

namespace {

// For each byte, the member that stands for it. They live as long as the process.
using CMembers = std::array<nb::handle, 256>;
CMembers gRecordKinds, gLineKinds, gLimitKinds, gRoles, gScopeKinds, gResolutions, gParameterKinds,
    gHintKinds;

constexpr auto kRoleWords = std::to_array<std::string_view>({
#define CODELOOM_ROLE_WORD(name, word, meaning) word,
    CODELOOM_ROLES(CODELOOM_ROLE_WORD)
#undef CODELOOM_ROLE_WORD
});

constexpr auto kScopeKindWords = std::to_array<std::string_view>({
#define CODELOOM_SCOPE_KIND_WORD(name, word, meaning) word,
    CODELOOM_SCOPE_KINDS(CODELOOM_SCOPE_KIND_WORD)
#undef CODELOOM_SCOPE_KIND_WORD
});

std::array<const CRecordKind*, 256> gTableOfRecordKinds;

// "string expression" is STRING_EXPRESSION.
std::string MemberName(std::string_view word) {
    std::string name(word);
    for (char& c : name) {
        const bool is_lower = c >= 'a' && c <= 'z';
        if (is_lower)
            c = static_cast<char>(c - 'a' + 'A');
        else
            c = '_';
    }
    return name;
}

struct CMember {
    unsigned char number;
    std::string_view word;
};

// An enum of the host whose values are the words.
void MakeEnum(nb::module_& module, const char* name, const char* documentation,
              const std::vector<CMember>& members, CMembers& by_number) {
    nb::list pairs;
    for (const CMember& member : members) {
        pairs.append(nb::make_tuple(nb::str(MemberName(member.word).c_str()),
                                    nb::str(member.word.data(), member.word.size())));
    }
    nb::object made = nb::module_::import_("enum").attr("Enum")(
        name, pairs, nb::arg("module") = module.attr("__name__"), nb::arg("qualname") = name);
    made.attr("__doc__") = documentation;
    for (const CMember& member : members) {
        by_number[member.number] = nb::getattr(made, MemberName(member.word).c_str()).release();
    }
    module.attr(name) = made;
}

template <class Number>
constexpr unsigned char ByteOf(Number number) {
    return static_cast<unsigned char>(number);
}

nb::object Member(const CMembers& members, unsigned char number) {
    return nb::borrow(members[number]);
}

}  // namespace

void BindKinds(nb::module_& module) {
    std::vector<CMember> record_kinds;
    for (const CRecordKind& kind : kRecordKinds) {
        record_kinds.push_back({ByteOf(kind.kind), kind.word});
        gTableOfRecordKinds[ByteOf(kind.kind)] = &kind;
    }
    MakeEnum(module, "RecordKind", "What a record says of its name; docs/records.md lists all kinds.",
             record_kinds, gRecordKinds);

    std::vector<CMember> line_kinds;
#define CODELOOM_LINE_KIND(name, text) line_kinds.push_back({ByteOf(ELogicalType::name), text});
    CODELOOM_LOGICAL_TYPES(CODELOOM_LINE_KIND)
#undef CODELOOM_LINE_KIND
    MakeEnum(module, "LineKind", "What kind of statement a line holds or begins.", line_kinds, gLineKinds);

    MakeEnum(module, "LimitKind", "Why a line has not all of its records.",
             {{ByteOf(ELimit::kTooManyVisits), "too many nodes"}, {ByteOf(ELimit::kTooDeep), "too deep"}},
             gLimitKinds);

    std::vector<CMember> parameter_kinds, hint_kinds;
#define CODELOOM_PARAMETER_KIND(name, word) parameter_kinds.push_back({ByteOf(EParameterKind::name), word});
    CODELOOM_PARAMETER_KINDS(CODELOOM_PARAMETER_KIND)
#undef CODELOOM_PARAMETER_KIND
#define CODELOOM_HINT_KIND(name, word) hint_kinds.push_back({ByteOf(EHintKind::name), word});
    CODELOOM_HINT_KINDS(CODELOOM_HINT_KIND)
#undef CODELOOM_HINT_KIND
    MakeEnum(module, "ParameterKind", "How arguments reach a parameter.", parameter_kinds, gParameterKinds);
    MakeEnum(module, "HintKind", "What a type hint is about.", hint_kinds, gHintKinds);

    std::vector<CMember> roles, scope_kinds;
    for (size_t i = 0; i < kRoleWords.size(); ++i) roles.push_back({ByteOf(i), kRoleWords[i]});
    for (size_t i = 0; i < kScopeKindWords.size(); ++i)
        scope_kinds.push_back({ByteOf(i), kScopeKindWords[i]});
    MakeEnum(module, "Role", "What a name does where it appears; docs/names.md tells of each.", roles,
             gRoles);
    MakeEnum(module, "ScopeKind", "What makes a scope; docs/names.md tells of each.", scope_kinds,
             gScopeKinds);
    MakeEnum(module, "Resolution",
             "Where a name is bound: in a scope of the text, nowhere in it as a builtin, "
             "perhaps by `import *` or on a line with a fault, or nowhere that can be seen.",
             {{ByteOf(EResolution::kScope), "scope"},
              {ByteOf(EResolution::kBuiltin), "builtin"},
              {ByteOf(EResolution::kPerhaps), "perhaps"},
              {ByteOf(EResolution::kUnknown), "unknown"}},
             gResolutions);
}

nb::object RoleOf(ERole role) {
    return Member(gRoles, ByteOf(role));
}

nb::object ScopeKindOf(EScopeKind kind) {
    return Member(gScopeKinds, ByteOf(kind));
}

nb::object ParameterKindOf(EParameterKind kind) {
    return Member(gParameterKinds, ByteOf(kind));
}

nb::object HintKindOf(EHintKind kind) {
    return Member(gHintKinds, ByteOf(kind));
}

nb::object ResolutionOf(EResolution resolution) {
    return resolution == EResolution::kNone ? nb::none() : Member(gResolutions, ByteOf(resolution));
}

std::string_view WordOfRole(ERole role) {
    return kRoleWords[static_cast<size_t>(role)];
}

std::string_view WordOfScopeKind(EScopeKind kind) {
    return kScopeKindWords[static_cast<size_t>(kind)];
}

nb::object RecordKindOf(char kind) {
    return Member(gRecordKinds, ByteOf(kind));
}

nb::object LineKindOf(ELogicalType type) {
    return Member(gLineKinds, ByteOf(type));
}

nb::object LimitKindOf(ELimit limit) {
    return Member(gLimitKinds, ByteOf(limit));
}

std::string_view PayloadFormOf(char kind) {
    return gTableOfRecordKinds[ByteOf(kind)]->payload;
}

std::string_view WordOfRecordKind(char kind) {
    return gTableOfRecordKinds[ByteOf(kind)]->word;
}

}  // namespace codeloom
