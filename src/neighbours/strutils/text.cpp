#include "neighbours/strutils/text.h"

#include <algorithm>
#include <array>
#include <charconv>

#include "host/text.h"
#include "strutils/utf8.h"
#include "text/unicode_names.h"

namespace codeloom {

namespace {

constexpr Py_UCS4 kReplacementChar = 0xFFFD;

nb::object NewBytes(std::string_view utf8) {
    return nb::bytes(utf8.data(), utf8.size());
}

template <class Pieces>
nb::object Joined(const Pieces& pieces) {
    size_t size = 0;
    for (const std::string_view piece : pieces) size += piece.size();
    PyObject* const bytes = PyBytes_FromStringAndSize(nullptr, static_cast<Py_ssize_t>(size));
    if (bytes == nullptr) throw nb::python_error();
    char* end = PyBytes_AS_STRING(bytes);
    for (const std::string_view piece : pieces) end = std::copy(piece.begin(), piece.end(), end);
    return nb::steal<nb::object>(bytes);
}

}  // namespace

nb::object AsUtf8(nb::handle text) {
    if (PyBytes_Check(text.ptr())) return nb::borrow(text);
    return NewBytes(CUtf8(text));
}

nb::object AsStr(nb::handle text) {
    if (PyUnicode_Check(text.ptr())) return nb::borrow(text);
    return TextFromUtf8(CUtf8(text));
}

nb::object JoinUtf8(std::initializer_list<std::string_view> pieces) {
    return Joined(pieces);
}

nb::object Utf8Concat5(nb::handle s0, nb::handle s1, nb::handle s2, nb::handle s3, nb::handle s4) {
    const std::array<nb::handle, 5> strings = {s0, s1, s2, s3, s4};
    std::array<CUtf8, 5> texts;
    std::array<std::string_view, 5> pieces;
    for (size_t i = 0; i < strings.size(); ++i) {
        if (strings[i].is_none()) continue;
        pieces[i] = texts[i] = CUtf8(strings[i]);
    }
    return Joined(pieces);
}

nb::object BytesForInteger(Py_ssize_t value) {
    std::array<char, 24> digits;
    const char* const end = std::to_chars(digits.data(), digits.data() + digits.size(), value).ptr;
    return NewBytes({digits.data(), static_cast<size_t>(end - digits.data())});
}

Py_ssize_t Utf8Len(nb::handle text) {
    const CUtf8 utf8(text);
    if (PyUnicode_Check(text.ptr())) return static_cast<Py_ssize_t>(utf8->size());
    return std::count_if(utf8->begin(), utf8->end(),
                         [](char c) { return IsUtf8LeadByte(static_cast<unsigned char>(c)); });
}

Py_UCS4 _NonInlineUcs4CharAtUtf8Pos(const char* utf8_ptr, Py_ssize_t pos, Py_ssize_t end_pos) {
    const CDecodedChar decoded =
        DecodeChar({utf8_ptr, static_cast<size_t>(end_pos)}, static_cast<size_t>(pos));
    return decoded.length == 0 ? kReplacementChar : decoded.code;
}

}  // namespace codeloom
