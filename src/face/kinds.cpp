#include "face/kinds.h"

#include <array>
#include <string>

namespace codeloom {

namespace {

// The member for each word, by its number. They live as long as the process.
using CMembers = std::array<nb::handle, 256>;
template <class Kind>
CMembers gMembers;

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

// An enum of the host whose values are the words of a kind.
template <class Kind>
void MakeEnum(nb::module_& module, const char* name, const char* documentation) {
    nb::list pairs;
    for (const std::string_view word : WordsOf<Kind>())
        pairs.append(nb::make_tuple(nb::str(MemberName(word).c_str()), nb::str(word.data(), word.size())));
    nb::object made = nb::module_::import_("enum").attr("Enum")(
        name, pairs, nb::arg("module") = module.attr("__name__"), nb::arg("qualname") = name);
    made.attr("__doc__") = documentation;
    size_t number = 0;
    for (const std::string_view word : WordsOf<Kind>())
        gMembers<Kind>[number++] = nb::getattr(made, MemberName(word).c_str()).release();
    module.attr(name) = made;
}

}  // namespace

void BindKinds(nb::module_& module) {
    MakeEnum<ERecordKind>(module, "RecordKind",
                          "What a record says of its name; docs/records.md lists all kinds.");
    MakeEnum<ELogicalType>(module, "LineKind", "What kind of statement a line holds or begins.");
    MakeEnum<ELimit>(module, "LimitKind", "Why a line has not all of its records.");
    MakeEnum<EParameterKind>(module, "ParameterKind", "How arguments reach a parameter.");
    MakeEnum<EHintKind>(module, "HintKind", "What a type hint is about.");
    MakeEnum<ERole>(module, "Role", "What a name does where it appears; docs/names.md explains each.");
    MakeEnum<EScopeKind>(module, "ScopeKind", "What makes a scope; docs/names.md explains each.");
    MakeEnum<EResolution>(module, "Resolution",
                          "Where a name is bound: in a scope of the text, nowhere in it as a builtin, "
                          "perhaps (by `import *`, `exec` or `globals()`, or on a line with a fault), or "
                          "nowhere that can be seen.");
}

template <class Kind>
nb::object MemberOf(Kind kind) {
    return nb::borrow(gMembers<Kind>[NumberOf(kind)]);
}

template nb::object MemberOf(ERecordKind);
template nb::object MemberOf(ELogicalType);
template nb::object MemberOf(ELimit);
template nb::object MemberOf(ERole);
template nb::object MemberOf(EScopeKind);
template nb::object MemberOf(EParameterKind);
template nb::object MemberOf(EHintKind);

nb::object MemberOf(EResolution resolution) {
    return resolution == EResolution::kNone ? nb::none() : MemberOf<EResolution>(resolution);
}

}  // namespace codeloom
