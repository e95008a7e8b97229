#include "strutils/bind.h"

#include "host/truth.h"
#include "strutils/arguments.h"
#include "strutils/text.h"

namespace codeloom {

namespace {

template <auto test>
bool CheckedTest(const CUtf8Argument& utf8_ptr, Py_ssize_t pos, Py_ssize_t end_pos) {
    return utf8_ptr.HasByteAt(pos, end_pos) && test(utf8_ptr.Pointer(), pos, end_pos) != 0;
}

Py_ssize_t HostAdjustUtf8Pos(const CUtf8Argument& utf8_ptr, Py_ssize_t pos, Py_ssize_t diff,
                             Py_ssize_t end_pos) {
    utf8_ptr.Require("end_pos", end_pos);
    return AdjustUtf8Pos(utf8_ptr.Pointer(), pos, diff, end_pos);
}

nb::object HostUcs4CharAtUtf8Pos(const CUtf8Argument& utf8_ptr, Py_ssize_t pos, Py_ssize_t end_pos) {
    const bool has_char = utf8_ptr.HasByteAt(pos, end_pos);
    const Py_UCS4 ch = has_char ? Ucs4CharAtUtf8Pos(utf8_ptr.Pointer(), pos, end_pos) : 0;
    return nb::steal<nb::object>(PyUnicode_FromOrdinal(static_cast<int>(ch)));
}

bool HostIsIdentifierCharAtUtf8Pos(const CUtf8Argument& utf8_ptr, Py_ssize_t pos, Py_ssize_t end_pos,
                                   CTruth initial) {
    if (!utf8_ptr.HasByteAt(pos, end_pos)) return false;
    return CheckedResult(IsIdentifierCharAtUtf8Pos(utf8_ptr.Pointer(), pos, end_pos, initial), -1) != 0;
}

Py_ssize_t HostPtrFindByte(const CUtf8Argument& ptr, Py_ssize_t length, CByteArgument c, Py_ssize_t start) {
    ptr.Require("length", length);
    return CheckedResult(PtrFindByte(ptr.Pointer(), length, c.byte, start), Py_ssize_t{-2});
}

Py_ssize_t HostBytesFindByte(nb::handle b, CByteArgument c, Py_ssize_t start) {
    return CheckedResult(BytesFindByte(b, c.byte, start), Py_ssize_t{-2});
}

void BindStringPrimitives(nb::module_& module) {
    module.def(
        "OrdAt", [](nb::handle s, Py_ssize_t i) { return CheckedResult(OrdAt(s, i), -1L); }, "s"_a.none(),
        "i"_a, nb::sig("def OrdAt(s: bytes | str, i: int) -> int"),
        "The byte of a byte string or the code point of a text string at index `i`, from the end if\n"
        "negative. IndexError outside the string, TypeError for anything else.");
    module.def(
        "Utf8Concat2", [](nb::handle s0, nb::handle s1) { return Utf8Concat2(s0, s1); }, "s0"_a.none(),
        "s1"_a.none(), nb::sig("def Utf8Concat2(s0: bytes | str | None, s1: bytes | str | None) -> bytes"),
        "Both joined as UTF-8; None contributes nothing.");
    module.def(
        "Utf8Concat3", [](nb::handle s0, nb::handle s1, nb::handle s2) { return Utf8Concat3(s0, s1, s2); },
        "s0"_a.none(), "s1"_a.none(), "s2"_a.none(),
        nb::sig("def Utf8Concat3(s0: bytes | str | None, s1: bytes | str | None, s2: bytes | str | None) -> "
                "bytes"),
        "The three joined as UTF-8; None contributes nothing.");
    module.def(
        "Utf8Concat4",
        [](nb::handle s0, nb::handle s1, nb::handle s2, nb::handle s3) {
            return Utf8Concat4(s0, s1, s2, s3);
        },
        "s0"_a.none(), "s1"_a.none(), "s2"_a.none(), "s3"_a.none(),
        nb::sig("def Utf8Concat4(s0: bytes | str | None, s1: bytes | str | None, s2: bytes | str | None, s3: "
                "bytes | str | None) -> bytes"),
        "The four joined as UTF-8; None contributes nothing.");
    module.def(
        "GetUtf8Ptr", [](nb::handle u) { return AsUtf8(u); }, "u"_a.none(),
        nb::sig("def GetUtf8Ptr(u: bytes | str) -> bytes"),
        "The UTF-8 bytes of a byte or text string, as AsUtf8 gives them. TypeError for anything else.");
}

void BindPositionPrimitives(nb::module_& module) {
    module.def(
        "AdjustUtf8Pos", &HostAdjustUtf8Pos, "utf8_ptr"_a, "pos"_a, "diff"_a, "end_pos"_a,
        "The byte offset of the character that lies `diff` characters after (before, if negative) the one\n"
        "that byte `pos` is part of; -1 or `end_pos` when it isn't in the buffer. A `pos` outside the\n"
        "buffer isn't part of a character, and each byte between it and the buffer counts as one.\n"
        "ValueError when `end_pos` lies outside the buffer.");
    module.def(
        "Ucs4CharAtUtf8Pos", &HostUcs4CharAtUtf8Pos, "utf8_ptr"_a, "pos"_a, "end_pos"_a,
        nb::sig("def Ucs4CharAtUtf8Pos(utf8_ptr: bytes | str, pos: int, end_pos: int) -> str"),
        "The character at byte `pos`, a text string of one: \"\\0\" when `pos` isn't in the buffer, U+FFFD\n"
        "where no well-formed character begins. ValueError when `end_pos` lies outside the buffer.");
    module.def("IsSpaceAtUtf8Pos", &CheckedTest<IsSpaceAtUtf8Pos>, "utf8_ptr"_a, "pos"_a, "end_pos"_a,
               "True when the character at byte `pos` is a blank; False when `pos` isn't in the buffer.\n"
               "ValueError when `end_pos` lies outside the buffer.");
    module.def("IsDigitAtUtf8Pos", &CheckedTest<IsDigitAtUtf8Pos>, "utf8_ptr"_a, "pos"_a, "end_pos"_a,
               "True when the character at byte `pos` is a digit; False when `pos` isn't in the buffer.\n"
               "ValueError when `end_pos` lies outside the buffer.");
    module.def(
        "IsAlnumAtUtf8Pos", &CheckedTest<IsAlnumAtUtf8Pos>, "utf8_ptr"_a, "pos"_a, "end_pos"_a,
        "True when the character at byte `pos` is a letter or a numeric character; False when `pos` isn't\n"
        "in the buffer. ValueError when `end_pos` lies outside the buffer.");
    module.def(
        "IsIdentifierCharAtUtf8Pos", &HostIsIdentifierCharAtUtf8Pos, "utf8_ptr"_a, "pos"_a, "end_pos"_a,
        "initial"_a,
        "True when the character at byte `pos` could be part of a name, its first character if `initial`;\n"
        "False when `pos` isn't in the buffer. Beyond ASCII, a character that is neither a name on its own "
        "nor\n"
        "a digit is refused. ValueError when `end_pos` lies outside the buffer.");
    module.def(
        "PtrFindByte", &HostPtrFindByte, "ptr"_a, "length"_a, "c"_a, "start"_a,
        "The offset of the first byte `c` in ptr[start:length]; -1 when there is none. ValueError unless\n"
        "0 <= start < length, and when `length` lies outside the buffer.");
    module.def("BytesFindByte", &HostBytesFindByte, "b"_a.none(), "c"_a, "start"_a = 0,
               nb::sig("def BytesFindByte(b: bytes, c: int | bytes | str, start: int = 0) -> int"),
               "The offset of the first byte `c` in b[start:]; -1 when there is none. ValueError unless\n"
               "0 <= start < len(b), TypeError when `b` isn't a byte string.");
}

}  // namespace

void BindTextPrimitives(nb::module_& module) {
    BindStringPrimitives(module);
    BindPositionPrimitives(module);
}

}  // namespace codeloom
