#include "face/bind_items.h"
#include "face/bind_names.h"
#include "face/kinds.h"
#include "face/signature_items.h"
#include "host/text.h"

namespace nb = nanobind;

namespace codeloom {

namespace {

void BindHint(nb::module_& module) {
    auto hint = BindItem<CHintItem>(module, "Hint",
                                    "A type hint: an annotation (PEP 3107, PEP 526), or one in a "
                                    "comment (PEP 484).");
    hint.def_prop_ro(
        "text", [](const CHintItem& self) { return TextFromUtf8(TextOf(*self.file, self.Data().hint)); },
        nb::sig("def text(self) -> str"), "The hint as written, quotes included.");
    hint.def_prop_ro("range", &CHintItem::Range, "Where it is.");
    hint.def_prop_ro(
        "kind", [](const CHintItem& self) { return MemberOf(self.Data().kind); },
        nb::sig("def kind(self) -> HintKind"), "What it is about.");
    hint.def_prop_ro(
        "name", [](const CHintItem& self) { return TextFromUtf8(TextOf(*self.file, self.Data().target)); },
        nb::sig("def name(self) -> str"),
        "The name or chain that it is about; of what a function returns, that of the function.");
    hint.def_prop_ro("target", &CHintItem::Target, "Where that name is.");
    hint.def_prop_ro(
        "in_comment", [](const CHintItem& self) { return self.Data().in_comment; }, "It is in a comment.");
    hint.def_prop_ro("line", &CHintItem::Line, "The line that it is on.");
    hint.def("__repr__", [](const CHintItem& self) {
        return nb::str("<Hint {}: {}: {}>")
            .format(self.Range().row, TextFromUtf8(TextOf(*self.file, self.Data().target)),
                    TextFromUtf8(TextOf(*self.file, self.Data().hint)));
    });
}

void BindParameter(nb::module_& module) {
    nb::class_<CParameterItem> parameter(module, "Parameter", "A parameter of a `def`.", nb::pooled(),
                                         nb::type_slots(kNotMadeByHost));
    BindEquality(parameter);
    BindCopies(parameter);
    parameter.def_prop_ro(
        "name", [](const CParameterItem& self) { return TextFromUtf8(TextOf(*self.file, self.Data().name)); },
        nb::sig("def name(self) -> str"), "Its name.");
    parameter.def_prop_ro("range", &CParameterItem::Range, "Where the name is.");
    parameter.def_prop_ro(
        "kind", [](const CParameterItem& self) { return MemberOf(self.Data().kind); },
        nb::sig("def kind(self) -> ParameterKind"), "How arguments reach it, in the words of `inspect`.");
    parameter.def_prop_ro("default", &CParameterItem::Default, nb::sig("def default(self) -> Range | None"),
                          "Where its default is; None without one.");
    parameter.def_prop_ro("hint", &CParameterItem::Hint, nb::sig("def hint(self) -> Hint | None"),
                          "Its annotation, else its hint in a comment; None without any.");
    parameter.def("__repr__", [](const CParameterItem& self) {
        return nb::str("<Parameter {}>").format(TextFromUtf8(TextOf(*self.file, self.Data().name)));
    });
}

void BindSignature(nb::module_& module) {
    auto signature = BindItem<CSignatureItem>(module, "Signature", "The header of a `def`.");
    signature.def_prop_ro(
        "name", [](const CSignatureItem& self) { return TextFromUtf8(TextOf(*self.file, self.Data().name)); },
        nb::sig("def name(self) -> str"), "The function's name.");
    signature.def_prop_ro("range", &CSignatureItem::Range, "Where the name is.");
    signature.def_prop_ro("line", &CSignatureItem::Line, "The line of the header.");
    signature.def_prop_ro(
        "is_async", [](const CSignatureItem& self) { return self.Data().is_async; }, "It is an `async def`.");
    signature.def_prop_ro(
        "is_method", [](const CSignatureItem& self) { return self.Data().is_method; },
        "It is right in the body of a class.");
    signature.def_prop_ro("parameters", &CSignatureItem::Parameters,
                          nb::sig("def parameters(self) -> tuple[Parameter, ...]"),
                          "Its parameters; those within a tuple of Python 2 one by one.");
    signature.def_prop_ro("return_hint", &CSignatureItem::ReturnHint,
                          nb::sig("def return_hint(self) -> Hint | None"),
                          "The hint of what it returns; None without one.");
    signature.def("__repr__", [](const CSignatureItem& self) {
        return nb::str("<Signature {}: {}>")
            .format(self.Range().row, TextFromUtf8(TextOf(*self.file, self.Data().name)));
    });
}

}  // namespace

void BindSignatureItems(nb::module_& module) {
    BindHint(module);
    BindParameter(module);
    BindSignature(module);
    BindItems<CHintItems>(module, "Hints", "class Hints(collections.abc.Sequence[Hint])");
    BindItems<CSignatureItems>(module, "Signatures", "class Signatures(collections.abc.Sequence[Signature])");
}

void BindSignaturesOfAnalysis(nb::class_<CAnalysis>& analysis) {
    analysis.def_prop_ro(
        "signatures",
        [](const CAnalysis& self) -> CSignatureItems {
            return {self.file, 0, 1, self.file->Signatures().items.size()};
        },
        "The header of each `def` that is sound, in the order of the text.");
    analysis.def_prop_ro(
        "hints",
        [](const CAnalysis& self) -> CHintItems {
            return {self.file, 0, 1, self.file->Signatures().hints.size()};
        },
        "Every type hint of the text, line by line: those of variables, attributes, parameters and of what "
        "functions return, in annotations and in comments.");
}

}  // namespace codeloom
