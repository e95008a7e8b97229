#include "_fastaccess/bind.h"

#include <optional>
#include <string>

#include "_fastaccess/non_nested_search.h"
#include "host/binding.h"
#include "neighbours/bind.h"
#include "neighbours/strutils/text.h"
#include "strutils/arguments.h"
#include "tokenizer/string_tokens.h"

namespace codeloom {

namespace {

// The tokens of a text of the host, which it keeps alive.
class CStringTokenizer : public CHosted {
  public:
    void Init(CUtf8Argument utf8) {
        _fText.assign(utf8.text);
        _fTokens.emplace(_fText);
    }

    CStringTokens& Tokens() { return *_fTokens; }

  private:
    std::string _fText;
    std::optional<CStringTokens> _fTokens;
};

constexpr const char* kStringTokenizerDoc =
    "The tokens of a piece of Python text, one after the other.\n\n"
    "CStringTokenizer(utf8) is on the first token of a byte or text string; comments and blanks, row\n"
    "ends among them, aren't tokens.";

constexpr const char* kNonNestedSearchDoc =
    "A search for bytes that lie outside brackets and string literals of Python source.\n\n"
    "InitWith sets it up, FindNext gives one hit after the other.";

nb::object TokenOf(CStringTokenizer& tokenizer) {
    const std::string_view token = tokenizer.Tokens().Token();
    return AsStr(nb::bytes(token.data(), token.size()));
}

Py_ssize_t HostFindStringEnd(const CNonNestedSearch& search, Py_ssize_t quote_i) {
    return CheckedResult(_FindStringEndNonNested(search.Search(), quote_i), Py_ssize_t{-2});
}

void BindStringTokenizer(nb::module_& module) {
    nb::class_<CStringTokenizer>(module, "CStringTokenizer", Plain(), kStringTokenizerDoc)
        .def(TInit<CUtf8Argument>(), "utf8"_a)
        .def_prop_ro(
            "fAtEnd", [](CStringTokenizer& tokenizer) { return tokenizer.Tokens().IsAtEnd(); },
            "True after the last token.")
        .def_prop_ro(
            "fPos", [](CStringTokenizer& tokenizer) { return tokenizer.Tokens().Pos(); },
            "The byte offset of the current token; the length of the text at the end.")
        .def_prop_ro(
            "fNestCount", [](CStringTokenizer& tokenizer) { return tokenizer.Tokens().NestCount(); },
            "The number of brackets open around the current token, which isn't counted itself.")
        .def("GetToken", &TokenOf, nb::sig("def GetToken(self) -> str"),
             "The text of the current token; empty at the end.")
        .def(
            "Next", [](CStringTokenizer& tokenizer) { tokenizer.Tokens().Next(); },
            "Move to the next token; at the end, nothing happens.");
}

void BindNonNestedSearch(nb::module_& module) {
    nb::class_<CNonNestedSearch>(module, "CNonNestedSearch", Plain(), kNonNestedSearchDoc)
        .def(TInit<>())
        .def(
            "InitWith",
            [](CNonNestedSearch& search, nb::handle to_search, nb::handle to_find_bytes, Py_ssize_t start,
               Py_ssize_t end) {
                return CheckedResult(search.InitWith(to_search, to_find_bytes, start, end), -1);
            },
            "to_search"_a.none(), "to_find_bytes"_a.none(), "start"_a, "end"_a,
            nb::sig(
                "def InitWith(self, to_search: object, to_find_bytes: bytes, start: int, end: int) -> int"),
            "Search the UTF-8 bytes start..end of a byte or text string for `to_find_bytes`. Anything\n"
            "else, None included, leaves the search idle. Returns 0. TypeError for a subclass of either\n"
            "or when `to_find_bytes` isn't a byte string, AssertionError when `start` or `end` lies outside\n"
            "the text.")
        .def(
            "FindNext",
            [](CNonNestedSearch& search) { return CheckedResult(search.FindNext(), Py_ssize_t{-2}); },
            "The byte offset of the next hit, -1 when there is none; the search is idle then.")
        .def("Clear", &CNonNestedSearch::Clear, "Make the search idle and let go of the text.");
    module.def(
        "_FindStringEndNonNested", &HostFindStringEnd, "search"_a, "quote_i"_a,
        "The byte index after the string literal whose opening quote is at `quote_i` of the text\n"
        "searched. An unterminated one ends with its row, with triple quotes at the end of the search.\n"
        "IndexError when `quote_i` lies outside the text searched.");
}

}  // namespace

void BindFastAccess(nb::module_& module) {
    BindNonNestedSearch(module);
    BindFastAccessPrimitives(module);
    BindStringTokenizer(module);
}

}  // namespace codeloom
