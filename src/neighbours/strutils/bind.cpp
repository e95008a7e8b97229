#include "neighbours/bind.h"

#include "strutils/arguments.h"
#include "strutils/bind.h"
#include "strutils/text.h"

namespace codeloom {

namespace {

nb::object HostDecode(const CUtf8Argument& utf8_ptr, Py_ssize_t pos, Py_ssize_t end_pos) {
    utf8_ptr.Require("end_pos", end_pos);
    if (pos < 0 || pos >= end_pos) throw nb::index_error("pos lies outside the buffer");
    const Py_UCS4 ch = _NonInlineUcs4CharAtUtf8Pos(utf8_ptr.Pointer(), pos, end_pos);
    return nb::steal<nb::object>(PyUnicode_FromOrdinal(static_cast<int>(ch)));
}

}  // namespace

void BindStrutils(nb::module_& module) {
    BindTextPrimitives(module);
    module.def(
        "AsUtf8", [](nb::handle text) { return AsUtf8(text); }, "text"_a.none(),
        nb::sig("def AsUtf8(text: bytes | str) -> bytes"),
        "The UTF-8 bytes of a text string, lone surrogates in three bytes; a byte string as it is.\n"
        "TypeError for anything else.");
    module.def(
        "AsStr", [](nb::handle text) { return AsStr(text); }, "text"_a.none(),
        nb::sig("def AsStr(text: bytes | str) -> str"),
        "The text string for UTF-8 bytes, lone surrogates included; a text string as it is.\n"
        "UnicodeDecodeError for malformed bytes, TypeError for anything else.");
    module.def("BytesForInteger", &BytesForInteger, "value"_a,
               nb::sig("def BytesForInteger(value: int) -> bytes"),
               "The decimal digits of an integer of 64 bits, a minus sign before them if negative.");
    module.def(
        "Utf8Concat5",
        [](nb::handle s0, nb::handle s1, nb::handle s2, nb::handle s3, nb::handle s4) {
            return Utf8Concat5(s0, s1, s2, s3, s4);
        },
        "s0"_a.none(), "s1"_a.none(), "s2"_a.none(), "s3"_a.none(), "s4"_a.none(),
        nb::sig("def Utf8Concat5(s0: bytes | str | None, s1: bytes | str | None, s2: bytes | str | None, s3: "
                "bytes | str | None, s4: bytes | str | None) -> bytes"),
        "The five joined as UTF-8; None contributes nothing.");
    module.def(
        "Utf8Len", [](nb::handle text) { return Utf8Len(text); }, "text"_a.none(),
        nb::sig("def Utf8Len(text: bytes | str) -> int"),
        "Of a UTF-8 byte string the number of its characters, each byte but a continuation byte counting\n"
        "as one; of a text string the number of its UTF-8 bytes.");
    module.def(
        "IsUtf8LeadByte",
        [](CByteArgument byte) { return IsUtf8LeadByte(static_cast<unsigned char>(byte.byte)); }, "byte"_a,
        "True for every byte that starts a character: all but the continuation bytes.");
    module.def(
        "_NonInlineUcs4CharAtUtf8Pos", &HostDecode, "utf8_ptr"_a, "pos"_a, "end_pos"_a,
        nb::sig("def _NonInlineUcs4CharAtUtf8Pos(utf8_ptr: bytes | str, pos: int, end_pos: int) -> str"),
        "The character that begins at byte `pos`, a text string of one: U+FFFD where no well-formed\n"
        "character begins. IndexError or ValueError when `pos` or `end_pos` lies outside the buffer.");
}

}  // namespace codeloom
