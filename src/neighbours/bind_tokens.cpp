#include <algorithm>
#include <string>
#include <vector>

#include "host/collections.h"
#include "host/text.h"
#include "neighbours/bind.h"
#include "neighbours/logicalline/logical_types_host.h"
#include "text/token_type.h"
#include "tokenizer/match_case.h"

namespace codeloom {

using namespace nb::literals;

namespace {

// The tokens from `first` up to `end`, those there are; a removed one is empty. Their texts go to `text`, one
// after the other.
std::vector<CRawToken> TokensOf(const nb::tuple& toks, size_t first, size_t end, std::string& text) {
    std::vector<CRawToken> tokens;
    for (size_t i = first; i < std::min(end, nb::len(toks)); ++i) {
        const nb::handle tok = toks[i];
        const CUtf8 utf8 = tok.is_none() ? CUtf8() : CUtf8(tok);
        tokens.push_back(MakeToken(utf8, static_cast<uint32_t>(text.size())));
        text += utf8;
    }
    return tokens;
}

nb::object HostFindMatchOrCaseType(nb::tuple toks, Py_ssize_t first, Py_ssize_t end) {
    std::string text;
    const std::vector<CRawToken> tokens =
        TokensOf(toks, static_cast<size_t>(first), static_cast<size_t>(end), text);
    return HostText(FindMatchOrCaseType(tokens, text));
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
