#include "neighbours/symbolinfo/info_bytes.h"

#include "host/text.h"
#include "neighbours/strutils/text.h"
#include "symbolinfo/scoped_text.h"
#include "symbolinfo/vocabulary.h"

namespace codeloom {

namespace {

constexpr std::string_view kFirstIndex = "#0";

bool HasIndex(std::string_view name) {
    const size_t separator = name.rfind(kScopeIndexSep);
    return separator != std::string_view::npos &&
           name.find_first_not_of("0123456789", separator + 1) == std::string_view::npos &&
           separator + 1 < name.size();
}

// Calls `visit` with each name of a dotted scope; dots in brackets and strings part nothing.
template <class Visit>
void VisitScopeNames(std::string_view scope, Visit visit) {
    size_t name_start = 0;
    const auto end_pos = static_cast<Py_ssize_t>(scope.size());
    for (Py_ssize_t i = 0; i != -1 && i < end_pos; i = NextNonNestedUtf8PtrIndex(scope.data(), i, end_pos)) {
        const auto pos = static_cast<size_t>(i);
        if (scope[pos] != '.') continue;
        visit(scope.substr(name_start, pos - name_start));
        name_start = pos + 1;
    }
    visit(scope.substr(name_start));
}

void AppendName(std::string& scope, std::string_view name) {
    if (!scope.empty()) scope += '.';
    scope += name;
}

}  // namespace

nb::object BuildLiteralInfo(std::string_view type_name, nb::handle text) {
    if (text.is_none()) return JoinUtf8({kTypedLiteralPrefix, type_name, kClassInstanceSuffix});
    const CUtf8 utf8(text);
    return JoinUtf8({kTypedLiteralPrefix, type_name, kClassInstanceSuffix, " ", utf8});
}

std::string EnsureScopeNameIndicies(std::string_view scope) {
    std::string result;
    if (scope == kModuleScopeName) return result;
    VisitScopeNames(scope, [&](std::string_view name) {
        AppendName(result, name);
        if (name != kWildcardScope && name != kDefLineScopeName && !HasIndex(name)) result += kFirstIndex;
    });
    return result;
}

std::string GetInstanceNameForClass(std::string_view cls_name) {
    std::string result;
    VisitScopeNames(cls_name, [&](std::string_view name) {
        if (name.ends_with(kFirstIndex)) name.remove_suffix(kFirstIndex.size());
        AppendName(result, name);
    });
    result += kClassInstanceSuffix;
    return result;
}

}  // namespace codeloom
