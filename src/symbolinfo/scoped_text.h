// Walking a scoped text: the bytes that lie outside brackets and strings.
#pragma once

#include <Python.h>

#include "neighbours/symbolinfo/nested_text.h"
#include "text/char_class.h"

namespace codeloom {

// The next index that isn't nested, which needn't be a character's first byte; -1 when `pos` isn't below
// `end_pos`, or negative. A prefix of a string is walked byte by byte.
inline Py_ssize_t NextNonNestedUtf8PtrIndex(const char* utf8_ptr, Py_ssize_t pos, Py_ssize_t end_pos) {
    if (pos < 0 || pos >= end_pos) return -1;
    const EByteKind kind = ByteKind(utf8_ptr[pos]);
    if (kind == EByteKind::kQuote || kind == EByteKind::kOpener)
        return _NonInlineNextNonNestedUtf8PtrIndex(utf8_ptr, pos, end_pos);
    return pos + 1;
}

}  // namespace codeloom
