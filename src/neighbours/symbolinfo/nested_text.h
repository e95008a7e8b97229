// Stepping over what is nested in a text: brackets and strings.
#pragma once

#include <Python.h>

namespace codeloom {

// The index after the bracket with all that it encloses, or after the string, that begins at `pos`;
// `end_pos` when it doesn't end before that. Kinds of brackets aren't matched. For any other byte the next
// index.
Py_ssize_t _NonInlineNextNonNestedUtf8PtrIndex(const char* utf8_ptr, Py_ssize_t pos, Py_ssize_t end_pos);

}  // namespace codeloom
