#include <vector>

#include "host/collections.h"
#include "host/text.h"
#include "neighbours/bind.h"
#include "neighbours/logicalline/logical_types_host.h"
#include "neighbours/match_case.h"
#include "neighbours/token_type.h"

namespace codeloom {

using namespace nb::literals;

namespace {

nb::object HostFindMatchOrCaseType(nb::tuple toks, Py_ssize_t first, Py_ssize_t end) {
    std::vector<CUtf8> texts;
    for (nb::handle tok : toks) texts.push_back(tok.is_none() ? CUtf8() : CUtf8(tok));
    const std::vector<std::string_view> views(texts.begin(), texts.end());
    return HostText(FindMatchOrCaseType(views, first, end));
}

}  // namespace

void BindTokenTypes(nb::module_& module) {
    for (const CTokenTypeName& type : kTokenTypeNames)
        module.attr((std::string("kTokenId_") + std::string(type.name)).c_str()) =
            static_cast<int>(type.number);
    module.def(
        "GetTokenType", [](nb::object token, nb::handle) { return GetTokenType(CUtf8(token)); }, "token"_a,
        "unused"_a.none() = nb::none(),
        "The token type, an integer, of a token text (text or byte string): 1 for a name, 54 for what is no "
        "token.");
    module.def("FindMatchOrCaseType", &HostFindMatchOrCaseType, "toks"_a, "first"_a, "end"_a,
               "The logical type of the tokens from `first` up to `end`: kMatch or kCase when they form\n"
               "the header of such a statement (PEP 634), kUnknown when the word is a name.");
}

}  // namespace codeloom
