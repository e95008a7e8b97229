// Text between the host's strings and UTF-8.
//   in     text strings and UTF-8 byte strings of the host
//   out    byte strings, text strings, counts
// Lone surrogates, which a text string may hold, pass both ways in three bytes.
#pragma once

#include <initializer_list>
#include <string_view>

#include <nanobind/nanobind.h>

namespace nb = nanobind;

namespace codeloom {

// The UTF-8 bytes of a text string as a byte string; a byte string as it is. TypeError for anything else.
nb::object AsUtf8(nb::handle text);

// The text string for UTF-8 bytes; a text string as it is. UnicodeDecodeError for malformed bytes, TypeError
// for anything else.
nb::object AsStr(nb::handle text);

// The pieces in order, as one new byte string.
nb::object JoinUtf8(std::initializer_list<std::string_view> pieces);

// The same for strings of the host; none contributes nothing.
nb::object Utf8Concat5(nb::handle s0, nb::handle s1, nb::handle s2, nb::handle s3, nb::handle s4);

// The decimal digits of an integer, with its sign, as a byte string.
nb::object BytesForInteger(Py_ssize_t value);

// Of a UTF-8 byte string the number of its characters, each byte but a continuation byte counting as one; of
// a text string the number of its UTF-8 bytes.
Py_ssize_t Utf8Len(nb::handle text);

// The character that begins at byte `pos`, which is in the buffer. U+FFFD where no well-formed character
// begins, or where it doesn't end before `end_pos`.
Py_UCS4 _NonInlineUcs4CharAtUtf8Pos(const char* utf8_ptr, Py_ssize_t pos, Py_ssize_t end_pos);

}  // namespace codeloom
