#include "face/kinds.h"

#include <array>
#include <string>

#include "names/record_kinds.h"

namespace codeloom {

namespace {

// For each byte, the member that stands for it. They live as long as the process.
using CMembers = std::array<nb::handle, 256>;
CMembers gRecordKinds, gLineKinds, gLimitKinds;

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
