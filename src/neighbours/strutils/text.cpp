#include "neighbours/strutils/text.h"

#include <algorithm>
#include <array>
#include <charconv>
#include <cstring>

#include "host/hosted.h"
#include "host/text.h"
#include "neighbours/tokenizer/unicode_names.h"
#include "strutils/utf8.h"

namespace codeloom {

namespace {

constexpr Py_UCS4 kReplacementChar = 0xFFFD;

std::string_view BytesView(nb::handle bytes) {
    return {PyBytes_AS_STRING(bytes.ptr()), static_cast<size_t>(PyBytes_GET_SIZE(bytes.ptr()))};
}

nb::object BytesWithSurrogates(nb::handle text) {
    if (!PyErr_ExceptionMatches(PyExc_UnicodeEncodeError)) throw nb::python_error();
    PyErr_Clear();
    PyObject* const bytes = PyUnicode_AsEncodedString(text.ptr(), "utf-8", "surrogatepass");
    if (bytes == nullptr) throw nb::python_error();
    return nb::steal<nb::object>(bytes);
}

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

CUtf8Text::CUtf8Text(nb::handle text) {
    if (PyBytes_Check(text.ptr())) {
        _fView = BytesView(text);
        return;
    }
    if (!PyUnicode_Check(text.ptr())) RaiseWrongType("str or bytes", text);
    Py_ssize_t size = 0;
    if (const char* const utf8 = PyUnicode_AsUTF8AndSize(text.ptr(), &size)) {
        _fView = {utf8, static_cast<size_t>(size)};
        return;
    }
    _fMade = BytesWithSurrogates(text);
    _fView = BytesView(_fMade);
}

nb::object AsUtf8(nb::handle text) {
    if (PyBytes_Check(text.ptr())) return nb::borrow(text);
    return NewBytes(CUtf8Text(text).View());
}

nb::object AsStr(nb::handle text) {
    if (PyUnicode_Check(text.ptr())) return nb::borrow(text);
    return TextFromUtf8(CUtf8Text(text).View());
}

nb::object JoinUtf8(std::initializer_list<std::string_view> pieces) {
    return Joined(pieces);
}

nb::object Utf8Concat5(nb::handle s0, nb::handle s1, nb::handle s2, nb::handle s3, nb::handle s4) {
    const std::array<nb::handle, 5> strings = {s0, s1, s2, s3, s4};
    std::array<CUtf8Text, 5> texts;
    std::array<std::string_view, 5> pieces;
    for (size_t i = 0; i < strings.size(); ++i) {
        if (strings[i].is_none()) continue;
        texts[i] = CUtf8Text(strings[i]);
        pieces[i] = texts[i].View();
    }
    return Joined(pieces);
}

nb::object BytesForInteger(Py_ssize_t value) {
    std::array<char, 24> digits;
    const char* const end = std::to_chars(digits.data(), digits.data() + digits.size(), value).ptr;
    return NewBytes({digits.data(), static_cast<size_t>(end - digits.data())});
}

Py_ssize_t Utf8Len(nb::handle text) {
    const CUtf8Text utf8(text);
    const std::string_view view = utf8.View();
    if (PyUnicode_Check(text.ptr())) return static_cast<Py_ssize_t>(view.size());
    return std::count_if(view.begin(), view.end(),
                         [](char c) { return IsUtf8LeadByte(static_cast<unsigned char>(c)); });
}

Py_UCS4 _NonInlineUcs4CharAtUtf8Pos(const char* utf8_ptr, Py_ssize_t pos, Py_ssize_t end_pos) {
    const CDecodedChar decoded =
        DecodeChar({utf8_ptr, static_cast<size_t>(end_pos)}, static_cast<size_t>(pos));
    return decoded.length == 0 ? kReplacementChar : decoded.code;
}

}  // namespace codeloom
