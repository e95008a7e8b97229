// The search for bytes outside brackets and strings: one step over the text, nothing allocated.
#pragma once

#include <cstring>

#include <nanobind/nanobind.h>

#include "_fastaccess/non_nested_struct.h"
#include "host/errors.h"
#include "neighbours/fastaccess/string_end.h"
#include "text/char_class.h"

namespace codeloom {

// Sets up a search of search_ptr[start..end) for `to_find_bytes`, which the caller keeps alive. An empty one
// is never found. 0, or -1 on failure: AssertionError when `start` or `end` lies outside the zero-terminated
// text, TypeError when `to_find_bytes` isn't a byte string.
inline int InitNonNestedStruct(tNonNestedStruct& search, const char* search_ptr, nb::handle to_find_bytes,
                               Py_ssize_t start, Py_ssize_t end) {
    if (search_ptr != nullptr) {
        const auto length = static_cast<Py_ssize_t>(std::strlen(search_ptr));
        if (!HostAssertHolds(start >= 0 && start <= length && end >= 0 && end <= length)) return -1;
    }
    if (!PyBytes_Check(to_find_bytes.ptr())) {
        PyErr_Format(PyExc_TypeError, "expected bytes, %s found", Py_TYPE(to_find_bytes.ptr())->tp_name);
        return -1;
    }
    search.to_search = search_ptr;
    search.to_find = PyBytes_AS_STRING(to_find_bytes.ptr());
    search.to_find_len = PyBytes_GET_SIZE(to_find_bytes.ptr());
    if (search.to_find_len != 0) search.first_char = search.to_find[0];
    search.pos = start;
    search.end = search.to_find_len == 0 ? 0 : end;
    search.nest_count = 0;
    return 0;
}

// True when what is sought begins at `i`.
inline bool IsFoundAt(const tNonNestedStruct& search, Py_ssize_t i) {
    if (search.to_search[i] != search.first_char) return false;
    if (search.to_find_len == 1) return true;
    return i + search.to_find_len <= search.end &&
           std::memcmp(search.to_search + i, search.to_find, static_cast<size_t>(search.to_find_len)) == 0;
}

// The byte offset of the next occurrence outside brackets and strings, -1 when there is none. What is sought
// comes first, so that a bracket or a quote can be found too. Kinds of brackets aren't matched. On failure
// -2.
inline Py_ssize_t FindNextNonNestedStruct(tNonNestedStruct& search) {
    if (search.to_search == nullptr) return -1;
    while (search.pos < search.end) {
        const Py_ssize_t i = search.pos++;
        if (search.nest_count == 0 && IsFoundAt(search, i)) {
            search.pos = i + search.to_find_len;
            return i;
        }
        switch (ByteKind(search.to_search[i])) {
            case EByteKind::kQuote: {
                const Py_ssize_t string_end = _FindStringEndNonNested(search, i);
                if (string_end == -2) return -2;
                if (string_end > search.pos) search.pos = string_end;
                break;
            }
            case EByteKind::kOpener:
                ++search.nest_count;
                break;
            case EByteKind::kCloser:
                --search.nest_count;
                break;
            default:
                break;
        }
    }
    return -1;
}

}  // namespace codeloom
