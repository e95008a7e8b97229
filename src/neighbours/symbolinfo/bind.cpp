#include "symbolinfo/bind.h"

#include <string>
#include <vector>

#include "host/binding.h"
#include "host/collections.h"
#include "host/text.h"
#include "names/encode_literal.h"
#include "names/join_tokens.h"
#include "neighbours/bind.h"
#include "neighbours/symbolinfo/info_bytes.h"
#include "neighbours/symbolinfo/nested_text.h"
#include "strutils/arguments.h"
#include "symbolinfo/constants_by_name.h"
#include "symbolinfo/kind_filter.h"
#include "symbolinfo/vocabulary.h"

namespace codeloom {

namespace {

// The table as a tuple of tuples, for those who read records.
nb::tuple RecordKinds() {
    return MakeTuple(kRecordKinds.size(), [](Py_ssize_t i) -> nb::object {
        const CRecordKind& kind = kRecordKinds[static_cast<size_t>(i)];
        return nb::make_tuple(TextFromUtf8(kind.name), BytesFromUtf8(kind.prefix),
                              nb::int_(static_cast<int>(static_cast<unsigned char>(kind.kind))),
                              TextFromUtf8(kind.word), TextFromUtf8(kind.payload), TextFromUtf8(kind.meaning),
                              TextFromUtf8(kind.source), TextFromUtf8(kind.example));
    });
}

void BindVocabulary(nb::module_& module) {
    module.def(
        "_RecordKinds", &RecordKinds,
        nb::sig("def _RecordKinds() -> tuple[tuple[str, bytes, int, str, str, str, str, str], ...]"),
        "The kinds of records: name, prefix, kind, word, form of the payload, meaning, a line of source\n"
        "and the record that it yields.");
    module.def("_SymbolConstants", &ConstantsByName,
               nb::sig("def _SymbolConstants() -> dict[str, typing.Any]"),
               "The constants of the vocabulary by name.");
}

void BindKindFilter(nb::module_& module) {
    nb::class_<CKindFilter>(module, "CKindFilter", Plain(),
                            "A set of kinds: CKindFilter(kinds), a byte string of them.")
        .def(TInit<nb::bytes>(), "kinds"_a = nb::bytes(""))
        .def(
            "KindMatches",
            [](const CKindFilter& filter, CByteArgument kind) { return filter.KindMatches(kind.byte); },
            "kind"_a, "True when the kind is in the set.");
}

Py_ssize_t HostNextIndex(const CUtf8Argument& utf8_ptr, Py_ssize_t pos, Py_ssize_t end_pos) {
    utf8_ptr.Require("end_pos", end_pos);
    if (pos < 0 || pos >= end_pos) throw nb::index_error("pos lies outside the buffer");
    return _NonInlineNextNonNestedUtf8PtrIndex(utf8_ptr.Pointer(), pos, end_pos);
}

nb::object HostEncodeStringLiteral(const CUtf8Argument& text) {
    std::string storage;
    return BytesFromUtf8(EncodeStringLiteral(text.text, storage));
}

nb::object HostJoinTokens(nb::handle tokens) {
    const nb::list kept(nb::borrow(tokens));
    const std::vector<CUtf8> texts(kept.begin(), kept.end());
    const std::vector<std::string_view> views(texts.begin(), texts.end());
    return BytesFromUtf8(JoinTokens(views));
}

void BindRecordFunctions(nb::module_& module) {
    module.def(
        "BuildLiteralInfo",
        [](const CUtf8Argument& type_name, nb::handle text) {
            return BuildLiteralInfo(type_name.text, text);
        },
        "type_name"_a, "text"_a.none(),
        nb::sig("def BuildLiteralInfo(type_name: bytes | str, text: bytes | str | None) -> bytes"),
        "The record of a literal of this type with this text; None when the text isn't known.");
    module.def("EncodeStringLiteral", &HostEncodeStringLiteral, "text"_a,
               nb::sig("def EncodeStringLiteral(text: bytes | str) -> bytes"),
               "The text of a string literal with its prefix and quotes on one row: what ends rows is\n"
               "written as an escape, and a continued row is joined. The value is the same, but for raw\n"
               "strings.");
    module.def("JoinTokens", &HostJoinTokens, "tokens"_a,
               nb::sig("def JoinTokens(tokens: collections.abc.Iterable[bytes | str]) -> bytes"),
               "Tokens, or texts of expressions, joined with blanks as a formatter would.");
    module.def(
        "_NonInlineNextNonNestedUtf8PtrIndex", &HostNextIndex, "utf8_ptr"_a, "pos"_a, "end_pos"_a,
        "The byte index after the bracket or string that begins at `pos`; `end_pos` when it doesn't end.\n"
        "IndexError or ValueError when `pos` or `end_pos` lies outside the buffer.");
}

void BindScopeFunctions(nb::module_& module) {
    module.def(
        "EnsureScopeNameIndicies",
        [](const CUtf8Argument& scope) { return TextFromUtf8(EnsureScopeNameIndicies(scope.text)); },
        "scope"_a, nb::sig("def EnsureScopeNameIndicies(scope: bytes | str) -> str"),
        "A scope with an index after every name: \"A#1.f\" gives \"A#1.f#0\".");
    module.def(
        "GetInstanceNameForClass",
        [](const CUtf8Argument& cls_name) { return TextFromUtf8(GetInstanceNameForClass(cls_name.text)); },
        "cls_name"_a, nb::sig("def GetInstanceNameForClass(cls_name: bytes | str) -> str"),
        "The name that stands for an instance of a class: \"list\" gives \"list:\". The index of a first\n"
        "definition, \"#0\", is left out.");
}

}  // namespace

void BindSymbolInfo(nb::module_& module) {
    BindVocabulary(module);
    BindKindFilter(module);
    BindSymbolPrimitives(module);
    BindRecordFunctions(module);
    BindScopeFunctions(module);
}

}  // namespace codeloom
