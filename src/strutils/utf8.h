// strutils/: text as UTF-8 bytes, walked by byte offset, with no allocation and no decoding for ASCII.
//   in     a borrowed pointer to UTF-8 bytes, which its owner keeps alive, with byte offsets into it
//   out    offsets, code points, classes of characters
//   keeps  nothing
//   start  here; strings of the host in text.h
// No byte outside 0..end_pos is ever read, whatever `pos` is. Malformed bytes read as U+FFFD, which is of no
// class. A failure is a reserved value with a host exception pending: -1 here, -2 for a search.
#pragma once

#include <algorithm>
#include <cstring>

#include <Python.h>

#include "neighbours/strutils/text.h"
#include "text/char_class.h"

namespace codeloom {

// Every byte but a continuation byte.
inline bool IsUtf8LeadByte(unsigned char byte) {
    return (byte & 0xC0) != 0x80;
}

// True where a character begins, which a byte outside the buffer counts as too.
inline bool BeginsCharAt(const char* utf8_ptr, Py_ssize_t pos, Py_ssize_t end_pos) {
    if (pos < 0 || pos >= end_pos) return true;
    return IsUtf8LeadByte(static_cast<unsigned char>(utf8_ptr[pos]));
}

// `pos` moved `diff` bytes, but no further than to the edge of the buffer that it lies outside of.
inline Py_ssize_t MoveToBuffer(Py_ssize_t pos, Py_ssize_t& diff, Py_ssize_t end_pos) {
    Py_ssize_t moved = 0;
    if (pos < 0 && diff > 0) moved = std::min(diff, -1 - pos);
    if (pos > end_pos && diff < 0) moved = std::max(diff, end_pos - pos);
    diff -= moved;
    return pos + moved;
}

// The offset of the character that lies `diff` characters after (before, if negative) the one that `pos` is
// part of; -1 or `end_pos` when the buffer ends before it. A `pos` outside the buffer isn't part of a
// character, and each byte between it and the buffer counts as one.
inline Py_ssize_t AdjustUtf8Pos(const char* utf8_ptr, Py_ssize_t pos, Py_ssize_t diff, Py_ssize_t end_pos) {
    while (!BeginsCharAt(utf8_ptr, pos, end_pos)) --pos;
    pos = MoveToBuffer(pos, diff, end_pos);
    for (; diff > 0 && pos < end_pos; --diff) {
        do ++pos;
        while (!BeginsCharAt(utf8_ptr, pos, end_pos));
    }
    for (; diff < 0 && pos >= 0; ++diff) {
        do --pos;
        while (!BeginsCharAt(utf8_ptr, pos, end_pos));
    }
    return pos;
}

// The code point at `pos`; 0 outside the buffer.
inline Py_UCS4 Ucs4CharAtUtf8Pos(const char* utf8_ptr, Py_ssize_t pos, Py_ssize_t end_pos) {
    if (pos < 0 || pos >= end_pos) return 0;
    if (IsAscii(utf8_ptr[pos])) return static_cast<Py_UCS4>(utf8_ptr[pos]);
    return _NonInlineUcs4CharAtUtf8Pos(utf8_ptr, pos, end_pos);
}

// Tests the character at `pos`: a byte of ASCII with one test, a decoded character with the other; false
// outside the buffer.
template <class AsciiTest, class DecodedTest>
inline int TestCharAtUtf8Pos(const char* utf8_ptr, Py_ssize_t pos, Py_ssize_t end_pos,
                             AsciiTest is_ascii_match, DecodedTest is_match) {
    if (pos < 0 || pos >= end_pos) return false;
    if (IsAscii(utf8_ptr[pos])) return is_ascii_match(utf8_ptr[pos]);
    return is_match(_NonInlineUcs4CharAtUtf8Pos(utf8_ptr, pos, end_pos));
}

inline int IsSpaceAtUtf8Pos(const char* utf8_ptr, Py_ssize_t pos, Py_ssize_t end_pos) {
    return TestCharAtUtf8Pos(
        utf8_ptr, pos, end_pos, [](char c) { return c == ' ' || (c >= '\t' && c <= '\r'); },
        [](Py_UCS4 ch) { return Py_UNICODE_ISSPACE(ch) != 0; });
}

inline int IsDigitAtUtf8Pos(const char* utf8_ptr, Py_ssize_t pos, Py_ssize_t end_pos) {
    return TestCharAtUtf8Pos(
        utf8_ptr, pos, end_pos, [](char c) { return IsDigit(c); },
        [](Py_UCS4 ch) { return Py_UNICODE_ISDIGIT(ch) != 0; });
}

// A letter or a numeric character of any script.
inline int IsAlnumAtUtf8Pos(const char* utf8_ptr, Py_ssize_t pos, Py_ssize_t end_pos) {
    return TestCharAtUtf8Pos(
        utf8_ptr, pos, end_pos, [](char c) { return IsNameByte(c) && c != '_'; },
        [](Py_UCS4 ch) { return Py_UNICODE_ISALNUM(ch) != 0; });
}

// True when a text of this one character is a name, or when it is a digit and needn't be the `initial` one;
// -1 on a failure of the host.
inline int IsNameChar(Py_UCS4 ch, bool initial) {
    PyObject* const text = PyUnicode_FromOrdinal(static_cast<int>(ch));
    if (text == nullptr) return -1;
    const nb::object owner = nb::steal<nb::object>(text);
    if (PyUnicode_IsIdentifier(text) == 1) return true;
    return !initial && Py_UNICODE_ISDIGIT(ch) != 0;
}

// True when the character could be part of a name, its first one if `initial`. Beyond ASCII, one that can
// only continue a name and isn't a digit, as a combining mark, is refused.
inline int IsIdentifierCharAtUtf8Pos(const char* utf8_ptr, Py_ssize_t pos, Py_ssize_t end_pos, bool initial) {
    return TestCharAtUtf8Pos(
        utf8_ptr, pos, end_pos, [&](char c) { return IsNameByte(c) && !(initial && IsDigit(c)); },
        [&](Py_UCS4 ch) { return IsNameChar(ch, initial); });
}

// The offset of the first byte `c` in ptr[start..length); -1 when there is none. On failure -2: ValueError
// unless 0 <= start < length, so that a search in an empty buffer fails too.
inline Py_ssize_t PtrFindByte(const char* ptr, Py_ssize_t length, char c, Py_ssize_t start) {
    if (start < 0 || start >= length) {
        PyErr_SetString(PyExc_ValueError, "Invalid start");
        return -2;
    }
    const void* const found = std::memchr(ptr + start, c, static_cast<size_t>(length - start));
    return found == nullptr ? -1 : static_cast<const char*>(found) - ptr;
}

}  // namespace codeloom
